#pragma once

#include <QColor>
#include <QPalette>

class QWidget;

/// Every colour of the window, by what it is for.
namespace kestrum::qt {

struct Colours {
    QColor ground;  ///< behind the bars
    QColor surface; ///< behind rows, sheets and cards
    QColor ink;     ///< text
    QColor muted;   ///< marks, placeholders, what is secondary
    QColor line;    ///< hairlines
    QColor accent;  ///< what can be pressed, check marks, focus
    QColor danger;  ///< an error's title

    QColor pressed() const;  ///< a row or button that is held
    QColor selected() const; ///< a row that was chosen
    QColor onAccent() const { return surface; }
    static QColor dim() { return QColor(0, 0, 0, 115); } ///< over what a modal screen covers
};

const Colours& lightColours();
const Colours& darkColours();

/// The application's palette carries the scheme, so that a change reaches every widget as Qt's own event does.
QPalette paletteOf(const Colours& colours);
/// The scheme of the palette that `widget` draws with.
const Colours& coloursOf(const QWidget& widget);

/// Whether a palette that is not ours, the desktop's, is a dark one.
bool isDark(const QPalette& palette);

} // namespace kestrum::qt
