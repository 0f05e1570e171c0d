#pragma once

class QWidget;

namespace kestrum::qt {

/// What a desktop's user expects of every window, whatever it shows: Ctrl+Q and Ctrl+W close it, F11 gives it the
/// whole screen and takes it back.
void installShortcuts(QWidget& window);

} // namespace kestrum::qt
