#pragma once

#include "platform/Font.h"
#include "platform/Geometry.h"

#include <QFont>
#include <QRectF>
#include <QString>

/// Text as the window draws and measures it.
namespace kestrum::qt {

/// Makes the window use a sans-serif face: the desktop's font if it is one, else an installed one. Without a desktop
/// Qt may choose a monospaced face. Call it once, after the application exists.
void chooseSansSerif();

/// The font at its size in points; an empty family is the system's sans.
QFont fontOf(const Font& font);
/// For bars and cards: heavier than the text around it, lighter than a row's key.
QFont semiboldFont(double size);

/// UTF-8 text in one line: line breaks and other controls become blanks, and "…" replaces what follows after 4 KiB.
QString lineOf(std::string_view text);

Size measured(const QString& line, const QFont& font);

inline QRectF rectOf(const Rect& rect)
{
    return {rect.x, rect.y, rect.width, rect.height};
}

} // namespace kestrum::qt
