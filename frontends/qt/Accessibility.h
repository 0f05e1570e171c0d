#pragma once

namespace kestrum::qt {

/// Makes the window known to screen readers: tables as lists of "key, value" items that can be pressed, modal screens
/// as dialogs. Widgets covered by a modal screen refuse every action.
void installAccessibility();

} // namespace kestrum::qt
