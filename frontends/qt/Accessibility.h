#pragma once

namespace kestrum::qt {

/// Makes the window known to screen readers: tables as lists of "key, value" items that can be pressed, modal screens
/// as dialogs. What such a screen covers takes no action.
void installAccessibility();

} // namespace kestrum::qt
