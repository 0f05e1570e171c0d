#include "frontends/qt/Colours.h"

#include <QWidget>

namespace kestrum::qt {

namespace {

/// `over` laid on `under` with an opacity of `share`, 0 to 1.
QColor mixed(const QColor& under, const QColor& over, float share)
{
    const auto channel = [&](float a, float b) { return a + (b - a) * share; };
    return QColor::fromRgbF(channel(under.redF(), over.redF()), channel(under.greenF(), over.greenF()),
                            channel(under.blueF(), over.blueF()));
}

} // namespace

// clang-format off
const Colours& lightColours()
{
    static const Colours colours{
        .ground  = 0xF4F6F8,
        .surface = 0xFFFFFF,
        .ink     = 0x14181F,
        .muted   = 0x5B6472,
        .line    = 0xDDE1E7,
        .accent  = 0x0B6E99,
        .danger  = 0xB3261E,
    };
    return colours;
}

const Colours& darkColours()
{
    static const Colours colours{
        .ground  = 0x0F1216,
        .surface = 0x171B21,
        .ink     = 0xE9EDF2,
        .muted   = 0x9AA5B1,
        .line    = 0x2A313A,
        .accent  = 0x5CC2EA,
        .danger  = 0xFF8A80,
    };
    return colours;
}
// clang-format on

QColor Colours::pressed() const
{
    return mixed(surface, ink, 0.08f);
}
QColor Colours::selected() const
{
    return mixed(surface, accent, 0.12f);
}

QColor Colours::spread() const
{
    return mixed(surface, accent, 0.3f);
}

QPalette paletteOf(const Colours& colours)
{
    QPalette palette;
    palette.setColor(QPalette::Window, colours.ground);
    palette.setColor(QPalette::Base, colours.surface);
    palette.setColor(QPalette::Button, colours.surface);
    palette.setColor(QPalette::Mid, colours.line);
    for (const auto role : {QPalette::WindowText, QPalette::Text, QPalette::ButtonText})
        palette.setColor(role, colours.ink);
    palette.setColor(QPalette::PlaceholderText, colours.muted);
    palette.setColor(QPalette::ToolTipBase, colours.surface);
    palette.setColor(QPalette::ToolTipText, colours.ink);
    palette.setColor(QPalette::Highlight, colours.accent);
    palette.setColor(QPalette::HighlightedText, colours.onAccent());
    return palette;
}

bool isDark(const QPalette& palette)
{
    return palette.color(QPalette::Window).lightness() < palette.color(QPalette::WindowText).lightness();
}

const Colours& coloursOf(const QWidget& widget)
{
    return isDark(widget.palette()) ? darkColours() : lightColours();
}

} // namespace kestrum::qt
