#pragma once

#include <QIcon>

namespace kestrum::qt {

/// The window's icon: the desktop theme's icon where it has one, else our own.
QIcon windowIcon();

/// Our own icon as SVG, sharp in any size. Null without Qt's SVG plug-in, whose package may be missing.
QIcon drawnIcon();
/// Our own icon as pictures in the usual sizes, for a Qt without that plug-in.
QIcon paintedIcon();

} // namespace kestrum::qt
