#include "frontends/terminal/Cells.h"

#include <algorithm>
#include <cmath>
#include <stdexcept>

namespace kestrum::terminal {

namespace {

int column(double points)
{
    return static_cast<int>(std::lround(points / kPointsPerColumn));
}

std::string_view mark(Accessory accessory)
{
    switch (accessory) {
    case Accessory::DisclosureIndicator:
        return "›";
    case Accessory::CheckMark:
        return "✓";
    case Accessory::None:
        break;
    }
    return "";
}

} // namespace

void TerminalLabel::setText(std::optional<std::string_view> text)
{
    if (text)
        _text = beginning(*text);
    else
        _text.reset();
    _columns = columns(_text.value_or(""));
}

void TerminalLabel::draw(const Line& line) const
{
    if (_text)
        line.part(column(_frame.x), column(_frame.width)).put(0, *_text, {.bold = _font.bold});
}

int TerminalLabel::end() const
{
    return column(_frame.x) + _columns;
}

void Subviews::add(std::shared_ptr<View> view)
{
    auto* drawn = dynamic_cast<Drawn*>(view.get());
    if (!drawn)
        throw std::invalid_argument("a view of another toolkit");
    _drawn.push_back(drawn);
    _views.push_back(std::move(view));
}

void Subviews::draw(const Line& line) const
{
    for (const auto* each : _drawn)
        each->draw(line);
}

int Subviews::end() const
{
    int end = 0;
    for (const auto* each : _drawn)
        end = std::max(end, each->end());
    return end;
}

const std::string* Subviews::name() const
{
    for (const auto* each : _drawn)
        if (const auto* name = each->name())
            return name;
    return nullptr;
}

int Subviews::sideways() const
{
    int sideways = 0;
    for (const auto* each : _drawn)
        sideways = std::max(sideways, each->sideways());
    return sideways;
}

void Subviews::setSideways(int columns)
{
    for (auto* each : _drawn)
        each->setSideways(columns);
}

int TerminalScrollView::furthest() const
{
    // The content may be wider than its texts. Scrolling stops at the end of the text.
    if (_contentSize.width <= _frame.width)
        return 0;
    return std::max(0, std::min(_content.end(), column(_contentSize.width)) - column(_frame.width));
}

void TerminalScrollView::draw(const Line& line) const
{
    const int scrolled = sideways();
    auto strip = line.part(column(_frame.x), column(_frame.width), scrolled);
    _content.draw(strip);
    strip.markCut(scrolled > 0, scrolled < furthest());
}

int TerminalScrollView::end() const
{
    return column(_frame.x + _frame.width);
}

int TerminalScrollView::sideways() const
{
    return std::clamp(_scrolled, 0, furthest());
}

int TerminalCell::contentColumns() const
{
    return std::max(0, _columns - kInset - (_accessory == Accessory::None ? 0 : 2));
}

Rect TerminalCell::contentBounds() const
{
    return {0, 0, contentColumns() * kPointsPerColumn, kPointsPerLine};
}

std::string TerminalCell::name() const
{
    const auto* name = _style == CellStyle::Default ? _textLabel.name() : _content.name();
    return name ? *name : std::string();
}

void TerminalCell::draw(const Line& line) const
{
    line.fill();
    const auto content = line.part(0, contentColumns());
    if (_style == CellStyle::Default)
        content.part(kInset, content.width() - kInset).put(0, cutAtTheEnd(name(), content.width() - kInset));
    else
        _content.draw(content);
    line.part(_columns - kInset - 1, 1).put(0, mark(_accessory), {.colour = Colour::Accent});
}

} // namespace kestrum::terminal
