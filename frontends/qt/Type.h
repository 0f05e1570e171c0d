#pragma once

#include "platform/Font.h"
#include "platform/Geometry.h"

#include <QFont>
#include <QRectF>
#include <QString>

/// Text as the window draws and measures it.
namespace kestrum::qt {

/// Has the window set in a sans-serif face: the desktop's own font where it is one, else one that is installed. A
/// toolkit without a desktop may well choose a typewriter's. Called once there is an application.
void chooseSansSerif();

/// The font at its size in points; an empty family is the system's sans.
QFont fontOf(const Font& font);
/// Of bars and cards: heavier than the text around it, lighter than a row's key.
QFont semiboldFont(double size);

/// UTF-8 as it stands in one line: line breaks and other controls become blanks, and what lies beyond 4 KiB "…".
QString lineOf(std::string_view text);

Size measured(const QString& line, const QFont& font);

inline QRectF rectOf(const Rect& rect)
{
    return {rect.x, rect.y, rect.width, rect.height};
}

} // namespace kestrum::qt
