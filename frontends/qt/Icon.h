#pragma once

#include <QIcon>

namespace kestrum::qt {

/// The window's icon: the desktop theme's own where it has one, else ours.
QIcon windowIcon();

/// Ours as it was drawn, sharp in any size. Without Qt's SVG plug-in, a package that may be missing, it is null.
QIcon drawnIcon();
/// The same in the usual sizes, for a Qt without that plug-in.
QIcon paintedIcon();

} // namespace kestrum::qt
