#pragma once

namespace kestrum::qt {

/// Makes tables and their rows known to screen readers: a list of "key, value" items that can be pressed.
void installAccessibility();

} // namespace kestrum::qt
