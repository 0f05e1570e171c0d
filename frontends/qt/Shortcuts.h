#pragma once

class QWidget;

namespace kestrum::qt {

/// The usual shortcuts of a desktop window: Ctrl+Q and Ctrl+W close it, F11 turns full screen on and off.
void installShortcuts(QWidget& window);

} // namespace kestrum::qt
