#pragma once

#include <QColor>
#include <QPalette>

class QWidget;

/// All colours of the window, named by their use.
namespace kestrum::qt {

struct Colours {
    QColor ground;  ///< behind the bars
    QColor surface; ///< behind rows, sheets and cards
    QColor ink;     ///< text
    QColor muted;   ///< marks, placeholders and secondary text
    QColor line;    ///< hairlines
    QColor accent;  ///< pressable text, check marks, focus
    QColor danger;  ///< an error's title

    QColor pressed() const;  ///< a row or button while it is held
    QColor selected() const; ///< the chosen row
    QColor spread() const;   ///< behind a curve in accent, between the least and the greatest number
    QColor onAccent() const { return surface; }
    static QColor dim() { return QColor(0, 0, 0, 115); } ///< laid over the widgets that a modal screen covers
};

const Colours& lightColours();
const Colours& darkColours();

/// The scheme is stored in the application's palette, so Qt's own palette event tells every widget about a change.
QPalette paletteOf(const Colours& colours);
/// The colours of the scheme in `widget`'s palette.
const Colours& coloursOf(const QWidget& widget);

/// Whether a palette from the desktop, not one of ours, is a dark one.
bool isDark(const QPalette& palette);

} // namespace kestrum::qt
