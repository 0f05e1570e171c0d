#include "frontends/terminal/SheetScreen.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <string_view>
#include <utility>

namespace kestrum::terminal {

namespace {

constexpr int kInset = 1, kGap = 2; // columns
constexpr int kMark = 2;            // before a row: whether it moved, or is the serving cell
constexpr int kIndent = 15;         // facts stand beside their caption
constexpr int kNameOfLevel = 12, kValueOfLevel = 12, kBarOfLevel = 24;
constexpr int kBar = 10, kWidestCell = 24;
constexpr Style kDim{.dim = true};

/// A bar of `width` columns, in eighths of a column; dots for the rest of the scale.
void drawBar(const Line& line, int column, int width, double part)
{
    constexpr std::array<std::string_view, 8> kEighths = {"", "▏", "▎", "▍", "▌", "▋", "▊", "▉"};
    const int eighths = static_cast<int>(std::lround(part * width * 8));
    for (int i = 0; i < width; ++i) {
        const int here = std::clamp(eighths - 8 * i, 0, 8);
        if (here == 0)
            line.put(column + i, "·", kDim);
        else
            line.put(column + i, here == 8 ? "█" : kEighths[static_cast<std::size_t>(here)],
                     {.colour = Colour::Accent});
    }
}

std::string headingOf(const SheetColumn& column)
{
    return column.unit.empty() ? column.heading : column.heading + ' ' + column.unit;
}

} // namespace

TerminalSheet::TerminalSheet(SheetOwner& owner, Repaint& repaint, TerminalSheet*& place, wchar_t key)
    : _owner(owner), _repaint(repaint), _place(place), _key(key)
{
    _place = this;
    _repaint.repaintLater();
}

TerminalSheet::~TerminalSheet()
{
    _place = nullptr;
    _repaint.repaintLater();
}

void TerminalSheet::setContents(SheetContents contents)
{
    if (contents == _contents)
        return;
    _contents = std::move(contents);
    _width = -1;
    _repaint.repaintLater();
}

void TerminalSheet::layOut(int width, int height)
{
    if (width == _width && height == _height)
        return;
    _width = width;
    _height = height;
    layOutParts(width, true);
    if (_rows.size() > static_cast<std::size_t>(height))
        layOutParts(width, false);
}

/// `spaced`: with an empty line before each table.
void TerminalSheet::layOutParts(int width, bool spaced)
{
    _rows.clear();
    _widths.assign(_contents.parts.size(), {});
    for (std::size_t i = 0; i < _contents.parts.size(); ++i) {
        if (spaced && i > 0 && !_contents.parts[i].table.columns.empty())
            _rows.push_back({Row::Kind::Pieces});
        layOutFacts(_contents.parts[i], width);
        layOutTable(i);
    }
    if (_contents.parts.empty() && !_contents.hint.empty())
        for (const auto& each : wrapped(_contents.hint, width - 2 * kInset))
            _rows.push_back({Row::Kind::Pieces, {{kInset, each, kDim}}});
}

/// The caption, and beside it the facts: one after the other, those with a bar in lines below.
void TerminalSheet::layOutFacts(const SheetPart& part, int width)
{
    const bool isList = !part.table.columns.empty();
    Row line{Row::Kind::Pieces};
    if (!part.caption.empty())
        line.pieces.push_back({kInset, part.caption, {.bold = true}});
    const int indent = part.caption.empty() ? kInset : isList ? kInset + columns(part.caption) + kGap : kIndent;
    int at = indent;
    for (const auto& [heading, value] : part.facts) {
        if (value.bar)
            continue;
        const int wanted = columns(heading) + 1 + columns(value.text);
        if (at > indent && at + wanted > width - kInset) {
            _rows.push_back(std::exchange(line, {Row::Kind::Pieces}));
            at = indent;
        }
        line.pieces.push_back({at, heading, kDim});
        line.pieces.push_back({at + columns(heading) + 1, cutAtTheEnd(value.text, width - kInset - at), {}});
        at += wanted + kGap;
    }
    if (!line.pieces.empty())
        _rows.push_back(std::move(line));
    for (std::size_t i = 0; i < part.facts.size(); ++i)
        if (part.facts[i].value.bar)
            _rows.push_back({Row::Kind::Cells, {}, static_cast<std::size_t>(&part - _contents.parts.data()), i});
}

void TerminalSheet::layOutTable(std::size_t index)
{
    const auto& part = _contents.parts[index];
    const auto& table = part.table;
    auto& widths = _widths[index];
    for (std::size_t i = 0; i < table.columns.size(); ++i) {
        const bool isSorted = table.sort && table.sort->column == i;
        int value = columns(headingOf(table.columns[i])) + (isSorted ? 2 : 0), word = 0;
        for (const auto& row : table.rows) {
            value = std::max(value, std::min(columns(row.cells[i].text), kWidestCell));
            word = std::max(word, columns(row.cells[i].word));
        }
        widths.values.push_back(value);
        widths.words.push_back(word);
    }
    if (!table.rows.empty()) {
        _rows.push_back({Row::Kind::Heading, {}, index});
        for (std::size_t i = 0; i < table.rows.size(); ++i)
            _rows.push_back({Row::Kind::Cells, {}, index, part.facts.size() + i});
    }
    if (!part.note.empty())
        _rows.push_back({Row::Kind::Pieces, {{kInset, part.note, kDim}}});
}

/// Calls `draw` with each column in view and the place where it begins.
template <typename Draw>
void TerminalSheet::eachColumn(const Line& line, std::size_t part, Draw draw) const
{
    const auto& shown = _contents.parts[part].table.columns;
    const auto& widths = _widths[part];
    int at = kMark;
    std::size_t toSkip = part == 0 ? _skipped : 0;
    for (std::size_t i = 0; i < shown.size(); ++i) {
        if (!shown[i].isIdentity && toSkip > 0) {
            --toSkip;
            continue;
        }
        int width = widths.values[i];
        if (shown[i].hasBars)
            width += 1 + kBar + (widths.words[i] > 0 ? 1 + widths.words[i] : 0);
        if (at + width > line.width() - kInset) {
            line.put(line.width() - 1, "…", kDim);
            return;
        }
        draw(i, at, width);
        at += width + kGap;
    }
}

void TerminalSheet::drawHeading(const Line& line, std::size_t part)
{
    const auto& table = _contents.parts[part].table;
    if (part == 0)
        _headings.assign(table.columns.size(), -1);
    eachColumn(line, part, [&](std::size_t i, int at, int) {
        const auto& column = table.columns[i];
        if (part == 0)
            _headings[i] = at;
        auto heading = headingOf(column);
        if (table.sort && table.sort->column == i)
            heading += table.sort->isDescending ? " ↓" : " ↑";
        const int value = _widths[part].values[i];
        line.put(column.isNumeric ? at + value - columns(heading) : at, heading, {.bold = true, .underlined = true});
    });
}

void TerminalSheet::drawCells(const Line& line, std::size_t part, std::size_t row)
{
    const auto& facts = _contents.parts[part].facts;
    const auto& table = _contents.parts[part].table;
    if (row < facts.size()) { // a level
        const auto& [heading, value] = facts[row];
        line.put(kIndent, cutAtTheEnd(heading, kNameOfLevel - 1), kDim);
        const auto text = cutAtTheEnd(value.text, kValueOfLevel);
        int at = kIndent + kNameOfLevel + kValueOfLevel;
        line.put(at - columns(text), text);
        drawBar(line, at + kGap, kBarOfLevel, *value.bar);
        line.put(at + kGap + kBarOfLevel + kGap, value.word);
        return;
    }
    const auto& shown = table.rows[row - facts.size()];
    const Style style{.bold = shown.isReference};
    if (shown.isReference)
        line.put(0, "S", {.bold = true, .colour = Colour::Accent});
    else if (shown.moved != SheetRow::Moved::No)
        line.put(0, shown.moved == SheetRow::Moved::Up ? "↑" : "↓", {.colour = Colour::Accent});
    eachColumn(line, part, [&](std::size_t i, int at, int) {
        const auto& cell = shown.cells[i];
        const int width = _widths[part].values[i];
        const auto text = cutAtTheEnd(cell.text, width);
        line.put(table.columns[i].isNumeric ? at + width - columns(text) : at, text, style);
        if (cell.bar)
            drawBar(line, at + width + 1, kBar, *cell.bar);
        line.put(at + width + 1 + kBar + 1, table.columns[i].hasBars ? cell.word : std::string());
    });
}

void TerminalSheet::drawTitle(const Line& line) const
{
    const bool hasServing = std::ranges::any_of(_contents.parts, [](const auto& part) {
        return !part.table.rows.empty() && part.table.rows.front().isReference;
    });
    std::string right = hasServing ? "S serving cell" : "";
    if (_rows.size() > _visible)
        right += (right.empty() ? "" : "  ") + std::to_string(_first + 1) + "-" +
                 std::to_string(std::min(_rows.size(), _first + _visible)) + "/" + std::to_string(_rows.size());
    line.put(kInset, cutInTheMiddle(_contents.title, line.width() - 2 * kInset - columns(right) - kGap),
             {.bold = true});
    line.part(0, line.width() - kInset).putRight(right, kDim);
}

void TerminalSheet::drawBottom(const Line& line)
{
    const std::string_view keys = _contents.canSort ? "Tab sort  ? help  Esc back" : "? help  Esc back";
    _back = line.width() - kInset - columns(keys);
    line.put(kInset, cutAtTheEnd(_contents.status, _back - kInset - kGap));
    line.put(_back, keys, kDim);
    _back += columns(keys) - columns("Esc back");
}

void TerminalSheet::draw(Screen& screen)
{
    const int width = std::min(screen.columns(), kColumn);
    _bottom = screen.rows() - 1;
    _visible = static_cast<std::size_t>(std::max(1, _bottom - 1));
    layOut(width, static_cast<int>(_visible));
    _first = std::min(_first, _rows.size() > _visible ? _rows.size() - _visible : 0);
    _skipped = std::min(_skipped, mostColumnsToSkip());
    _headingLine = -1;
    for (std::size_t i = 0; i < _visible && _first + i < _rows.size(); ++i) {
        const auto& row = _rows[_first + i];
        const int number = 1 + static_cast<int>(i);
        const Line line(screen, number, 0, width);
        // The heading stays at the top while its rows are scrolled.
        const bool isRow = row.kind == Row::Kind::Cells && row.row >= _contents.parts[row.part].facts.size();
        if (row.kind == Row::Kind::Heading || (i == 0 && isRow)) {
            drawHeading(line, row.part);
            if (row.part == 0)
                _headingLine = number;
        } else if (row.kind == Row::Kind::Cells) {
            drawCells(line, row.part, row.row);
        } else {
            for (const auto& [column, text, style] : row.pieces)
                line.put(column, text, style);
        }
    }
    drawTitle({screen, 0, 0, width});
    drawBottom({screen, _bottom, 0, width});
    screen.placeCursor(_bottom, 0, false);
}

std::size_t TerminalSheet::mostColumnsToSkip() const
{
    if (_contents.parts.empty())
        return 0;
    const auto scrolled = std::ranges::count(_contents.parts.front().table.columns, false, &SheetColumn::isIdentity);
    return scrolled > 1 ? static_cast<std::size_t>(scrolled - 1) : 0;
}

void TerminalSheet::scroll(std::ptrdiff_t lines)
{
    const auto last = static_cast<std::ptrdiff_t>(_rows.size() > _visible ? _rows.size() - _visible : 0);
    _first = static_cast<std::size_t>(std::clamp(static_cast<std::ptrdiff_t>(_first) + lines, std::ptrdiff_t{0}, last));
}

void TerminalSheet::scrollSideways(int columns)
{
    const auto last = static_cast<std::ptrdiff_t>(mostColumnsToSkip());
    _skipped =
        static_cast<std::size_t>(std::clamp(static_cast<std::ptrdiff_t>(_skipped) + columns, std::ptrdiff_t{0}, last));
}

void TerminalSheet::sortByNeighbour(int step)
{
    if (!_contents.canSort || _contents.parts.empty() || _contents.parts.front().table.columns.empty())
        return;
    const auto& table = _contents.parts.front().table;
    const std::size_t count = table.columns.size();
    const std::size_t now = table.sort ? table.sort->column : count - 1;
    _owner.columnChosen(step == 0 ? now : step > 0 ? (now + 1) % count : (now + count - 1) % count);
}

void TerminalSheet::press(const Input& input)
{
    if (input.row == 0 || (input.row == _bottom && input.column >= _back))
        return _owner.sheetLeft();
    if (input.row != _headingLine || !_contents.canSort)
        return;
    for (std::size_t i = _headings.size(); i-- > 0;)
        if (_headings[i] >= 0 && input.column >= _headings[i])
            return _owner.columnChosen(i);
}

void TerminalSheet::handle(const Input& input)
{
    const auto page = static_cast<std::ptrdiff_t>(_visible > 1 ? _visible - 1 : 1);
    _repaint.repaintLater();
    switch (input.key) {
    case Key::Up:
    case Key::WheelUp:
        return scroll(-1);
    case Key::Down:
    case Key::WheelDown:
        return scroll(1);
    case Key::PageUp:
        return scroll(-page);
    case Key::PageDown:
        return scroll(page);
    case Key::Home:
        return scroll(-static_cast<std::ptrdiff_t>(_rows.size()));
    case Key::End:
        return scroll(static_cast<std::ptrdiff_t>(_rows.size()));
    case Key::Left:
    case Key::ShiftLeft:
        return scrollSideways(-1);
    case Key::Right:
    case Key::ShiftRight:
        return scrollSideways(1);
    case Key::Tab:
        return sortByNeighbour(1);
    case Key::BackTab:
        return sortByNeighbour(-1);
    case Key::Press:
        return press(input);
    case Key::Escape:
    case Key::Backspace:
        return _owner.sheetLeft();
    case Key::Character:
        break;
    default:
        return;
    }
    switch (input.character) {
    case L'k':
        return scroll(-1);
    case L'j':
        return scroll(1);
    case L'g':
        return handle({Key::Home});
    case L'G':
        return handle({Key::End});
    case L'h':
    case L'<':
        return scrollSideways(-1);
    case L'l':
    case L'>':
        return scrollSideways(1);
    case L'r':
        return sortByNeighbour(0);
    default:
        if (input.character == _key)
            _owner.sheetLeft();
        return;
    }
}

} // namespace kestrum::terminal
