#include "frontends/terminal/SheetScreen.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <string_view>
#include <utility>

namespace kestrum::terminal {

namespace {

constexpr int kMark = 2;    // before a row: whether it moved, or is the serving cell
constexpr int kIndent = 15; // facts stand beside their caption
constexpr int kNameOfLevel = 12, kValueOfLevel = 12, kBarOfLevel = 24;
constexpr int kBar = 10, kWidestCell = 60, kNarrowestCell = 20;
constexpr int kLeastPlot = 3, kMostOfLeastPlot = 8; // rows of a curve, where the rest does not leave more

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
    rememberPlace();
    _contents = std::move(contents);
    _width = -1;
    measureTables();
    _repaint.repaintLater();
}

const SheetRow* TerminalSheet::tableRow(const Row& row) const
{
    const auto& part = _contents.parts[row.part];
    if (row.kind != Row::Kind::Cells || row.row < part.facts.size())
        return nullptr;
    return &part.table.rows[row.row - part.facts.size()];
}

/// At its top a sheet stays there: the newest rows come first.
void TerminalSheet::rememberPlace()
{
    if (_width < 0) // not drawn since the last contents
        return;
    for (std::size_t i = 0; _first > 0 && i < _visible && _first + i < _rows.size(); ++i)
        if (const auto* row = tableRow(_rows[_first + i]))
            _anchors.push_back({_rows[_first + i].part, i, row->identity});
}

void TerminalSheet::returnToPlace()
{
    for (const auto& [part, line, identity] : std::exchange(_anchors, {}))
        for (std::size_t i = line; i < _rows.size(); ++i)
            if (const auto* row = tableRow(_rows[i]); row && _rows[i].part == part && row->identity == identity) {
                _first = i - line;
                return;
            }
}

void TerminalSheet::measureTables()
{
    _widths.assign(_contents.parts.size(), {});
    for (std::size_t part = 0; part < _widths.size(); ++part) {
        const auto& table = _contents.parts[part].table;
        for (std::size_t i = 0; i < table.columns.size(); ++i) {
            const bool isSorted = table.sort && table.sort->column == i;
            const int heading = columns(headingOf(table.columns[i])) + (isSorted ? 2 : 0);
            int value = heading, word = 0;
            for (const auto& row : table.rows) {
                value = std::max(value, std::min(columns(row.cells[i].text), kWidestCell));
                word = std::max(word, columns(row.cells[i].word));
            }
            _widths[part].headings.push_back(heading);
            _widths[part].values.push_back(value);
            _widths[part].words.push_back(word);
        }
    }
}

void TerminalSheet::layOut(int width, int height, PlotMarks marks)
{
    if (width == _width && height == _height && marks == _marks)
        return;
    _width = width;
    _height = height;
    _marks = marks;
    const int leastPlot = std::clamp(height / 3, kLeastPlot, kMostOfLeastPlot);
    layOutParts(true, leastPlot);
    const int free = height - static_cast<int>(_rows.size());
    const auto plots = static_cast<int>(
        std::ranges::count_if(_contents.parts, [](const auto& part) { return part.plot.has_value(); }));
    if (free < 0)
        layOutParts(false, leastPlot);
    else if (plots > 0)
        layOutParts(true, leastPlot + free / plots);
    returnToPlace();
}

/// `spaced`: with an empty line before each table.
void TerminalSheet::layOutParts(bool spaced, int plotRows)
{
    _rows.clear();
    _picture = {};
    const int width = std::min(_width, kColumn);
    for (std::size_t i = 0; i < _contents.parts.size(); ++i) {
        const auto& part = _contents.parts[i];
        if (spaced && i > 0 && !part.table.columns.empty())
            _rows.push_back({Row::Kind::Pieces});
        layOutFacts(part, width, !spaced && part.plot.has_value());
        if (part.plot)
            layOutPlot(*part.plot, plotRows);
        layOutTable(i);
    }
    if (_contents.parts.empty() && !_contents.hint.empty())
        layOutText(_contents.hint, width, kDim);
}

void TerminalSheet::layOutText(std::string_view text, int width, Style style)
{
    for (auto& each : wrapped(text, width - 2 * kInset))
        _rows.push_back({Row::Kind::Pieces, {{kInset, std::move(each), style}}});
}

/// The caption, and beside it the facts: one after the other, those with a bar in lines below. Lines of text come
/// between. `isBrief`: no bars, so that a plot has room.
void TerminalSheet::layOutFacts(const SheetPart& part, int width, bool isBrief)
{
    const bool isList = !part.table.columns.empty();
    Row line{Row::Kind::Pieces};
    int indent = kInset;
    if (!part.lines.empty()) {
        layOutText(part.caption, width, {.bold = true});
        for (const auto& each : part.lines)
            layOutText(each, width, {});
    } else if (!part.caption.empty()) {
        line.pieces.push_back({kInset, part.caption, {.bold = true}});
        indent = isList ? kInset + columns(part.caption) + kGap : kIndent;
    }
    int at = indent;
    for (const auto& [heading, value] : part.facts) {
        if (value.bar && !isBrief)
            continue;
        const int name = columns(heading) + 1, wanted = name + columns(value.text);
        if (at > indent && at + wanted > width - kInset) {
            _rows.push_back(std::exchange(line, {Row::Kind::Pieces}));
            at = indent;
        }
        line.pieces.push_back({at, heading, kDim});
        line.pieces.push_back({at + name, cutAtTheEnd(value.text, width - kInset - at - name), {}});
        at += wanted + kGap;
    }
    if (!line.pieces.empty())
        _rows.push_back(std::move(line));
    for (std::size_t i = 0; i < part.facts.size(); ++i)
        if (part.facts[i].value.bar && !isBrief)
            _rows.push_back({Row::Kind::Cells, {}, static_cast<std::size_t>(&part - _contents.parts.data()), i});
}

void TerminalSheet::layOutPlot(const SheetPlot& plot, int rows)
{
    auto picture = terminal::draw(plot, _marks, _width, rows);
    const std::size_t begin = _rows.size();
    for (auto& each : std::exchange(picture.lines, {}))
        _rows.push_back({Row::Kind::Pieces, std::move(each)});
    if (&plot != this->plot())
        return;
    _picture = std::move(picture);
    _plotRow = begin;
}

void TerminalSheet::layOutTable(std::size_t index)
{
    const auto& part = _contents.parts[index];
    if (!part.table.rows.empty()) {
        _rows.push_back({Row::Kind::Heading, {}, index});
        for (std::size_t i = 0; i < part.table.rows.size(); ++i)
            _rows.push_back({Row::Kind::Cells, {}, index, part.facts.size() + i});
    }
    if (!part.note.empty())
        _rows.push_back({Row::Kind::Pieces, {{kInset, part.note, kDim}}});
}

/// The columns that have room, from the left. Texts make way for further columns, but not numbers and headings.
std::vector<TerminalSheet::Placed> TerminalSheet::placeColumns(std::size_t part, int width) const
{
    const auto& shown = _contents.parts[part].table.columns;
    const auto& widths = _widths[part];
    std::vector<Placed> placed;
    std::size_t toSkip = part == 0 ? _skipped : 0;
    int room = width - kMark - kInset;
    for (std::size_t i = 0; i < shown.size(); ++i) {
        if (!shown[i].isIdentity && toSkip > 0) {
            --toSkip;
            continue;
        }
        const int least = shown[i].isNumeric ? widths.values[i] : std::min(widths.values[i], kNarrowestCell);
        int value = std::max(least, widths.headings[i]);
        const int beside = shown[i].hasBars ? 1 + kBar + (widths.words[i] > 0 ? 1 + widths.words[i] : 0) : 0;
        if (placed.empty())
            value = std::min(value, std::max(room - beside, 1));
        if (value + beside > room && !placed.empty())
            break;
        placed.push_back({i, 0, value, beside});
        room -= value + beside + kGap;
    }
    const bool hasMore = placed.empty() || placed.back().index + 1 < shown.size();
    room += hasMore ? kGap - 1 : kGap; // after the last one; "…" follows a blank
    for (bool isGrowing = true; isGrowing && room > 0;) {
        isGrowing = false;
        for (auto& each : placed)
            if (room > 0 && each.value < widths.values[each.index]) {
                ++each.value;
                --room;
                isGrowing = true;
            }
    }
    int at = kMark;
    for (auto& each : placed) {
        each.at = at;
        at += each.value + each.beside + kGap;
    }
    return placed;
}

void TerminalSheet::drawHeading(const Line& line, std::size_t part)
{
    const auto& table = _contents.parts[part].table;
    if (part == 0)
        _headings.assign(table.columns.size(), -1);
    for (const auto& [index, at, value, beside] : _placed[part]) {
        const auto& column = table.columns[index];
        if (part == 0)
            _headings[index] = at;
        auto heading = headingOf(column);
        if (table.sort && table.sort->column == index)
            heading += table.sort->isDescending ? " ↓" : " ↑";
        line.put(column.isNumeric ? at + value - columns(heading) : at, heading, {.bold = true, .underlined = true});
    }
    if (_placed[part].empty() || _placed[part].back().index + 1 < table.columns.size())
        line.put(line.width() - 1, "…", kDim);
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
    for (const auto& [index, at, value, beside] : _placed[part]) {
        const auto& cell = shown.cells[index];
        const auto text = cutAtTheEnd(cell.text, value);
        line.put(table.columns[index].isNumeric ? at + value - columns(text) : at, text, style);
        if (cell.bar)
            drawBar(line, at + value + 1, kBar, *cell.bar);
        line.put(at + value + 1 + kBar + 1, table.columns[index].hasBars ? cell.word : std::string());
    }
    if (_placed[part].empty() || _placed[part].back().index + 1 < table.columns.size())
        line.put(line.width() - 1, "…", kDim);
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
    const auto* plot = this->plot();
    const std::string more = plot && plot->ranges.size() > 1 ? "Tab time  " : _contents.canSort ? "Tab sort  " : "";
    std::string keys = "? help  Esc back";
    if (2 * kInset + columns(_contents.status) + kGap + columns(more + keys) <= line.width())
        keys.insert(0, more);
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
    layOut(screen.columns(), static_cast<int>(_visible), choosePlotMarks(screen.charset()));
    _first = std::min(_first, _rows.size() > _visible ? _rows.size() - _visible : 0);
    _skipped = std::min(_skipped, mostColumnsToSkip());
    _headingLine = -1;
    _placed.clear();
    for (std::size_t part = 0; part < _contents.parts.size(); ++part)
        _placed.push_back(placeColumns(part, screen.columns()));
    for (std::size_t i = 0; i < _visible && _first + i < _rows.size(); ++i) {
        const auto& row = _rows[_first + i];
        const int number = 1 + static_cast<int>(i);
        const Line line(screen, number, 0, screen.columns());
        // The heading stays at the top while its rows are scrolled.
        if (row.kind == Row::Kind::Heading || (i == 0 && tableRow(row))) {
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
    // Screen readers read the line of the cursor.
    const int reading = lineOf(_picture.reading);
    screen.placeCursor(reading > 0 ? reading : _bottom, 0, false);
}

/// The line of the screen that shows this line of the plot; -1 out of sight.
int TerminalSheet::lineOf(int plotLine) const
{
    const auto row = _plotRow + static_cast<std::size_t>(plotLine);
    if (plotLine < 0 || row < _first || row >= _first + _visible)
        return -1;
    return 1 + static_cast<int>(row - _first);
}

const SheetPlot* TerminalSheet::plot() const
{
    const auto found = std::ranges::find_if(_contents.parts, [](const auto& part) { return part.plot.has_value(); });
    return found == _contents.parts.end() ? nullptr : &*found->plot;
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
    if (pressPlot(input) || input.row != _headingLine || !_contents.canSort)
        return;
    for (std::size_t i = _headings.size(); i-- > 0;)
        if (_headings[i] >= 0 && input.column >= _headings[i])
            return _owner.columnChosen(i);
}

bool TerminalSheet::pressPlot(const Input& input)
{
    const auto* plot = this->plot();
    if (!plot)
        return false;
    const auto& cells = _picture.cells;
    const int top = lineOf(cells.row);
    if (top > 0 && Area{top, cells.column, cells.rows, cells.columns}.holds(input.row, input.column)) {
        _owner.cursorMoved(pointAt(*plot, input.column - cells.column, cells.columns));
        return true;
    }
    if (input.row != lineOf(0))
        return false;
    for (std::size_t i = 0; i < std::min(_picture.ranges.size(), plot->ranges.size()); ++i)
        if (Area{input.row, _picture.ranges[i], 1, columns(plot->ranges[i])}.holds(input.row, input.column)) {
            _owner.rangeChosen(i);
            return true;
        }
    return false;
}

/// The keys that have another meaning where there is a plot. The owner may change the contents at once.
bool TerminalSheet::handlePlot(const Input& input)
{
    const auto* plot = this->plot();
    if (!plot)
        return false;
    const auto is = [&](Key key, wchar_t letter) { return input.key == key || input.is(letter); };
    const auto beside = [&](bool isAfter, int columns) {
        _owner.cursorMoved(pointBeside(*plot, isAfter, columns));
        return true;
    };
    if (is(Key::Left, L'h') || is(Key::Right, L'l'))
        return beside(is(Key::Right, L'l'), _picture.cells.columns);
    if (is(Key::ShiftLeft, L'<') || is(Key::ShiftRight, L'>'))
        return beside(is(Key::ShiftRight, L'>'), 0);
    const std::size_t ranges = plot->ranges.size();
    if (input.key == Key::Home || input.key == Key::End) {
        const bool isToFirst = input.key == Key::Home && !(plot->points.empty() && plot->spans.empty());
        _owner.cursorMoved(isToFirst ? std::optional<std::size_t>(0) : std::nullopt);
    } else if (ranges > 0 && (input.key == Key::Tab || input.key == Key::BackTab)) {
        _owner.rangeChosen((plot->range + (input.key == Key::Tab ? 1 : ranges - 1)) % ranges);
    } else if (input.key == Key::Character && input.character >= L'1' &&
               input.character < L'1' + static_cast<wchar_t>(std::min<std::size_t>(ranges, 9))) {
        _owner.rangeChosen(static_cast<std::size_t>(input.character - L'1'));
    } else {
        return false;
    }
    return true;
}

void TerminalSheet::handle(const Input& input)
{
    if (handlePlot(input))
        return _repaint.repaintLater();
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
        return scroll(-static_cast<std::ptrdiff_t>(_rows.size()));
    case L'G':
        return scroll(static_cast<std::ptrdiff_t>(_rows.size()));
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
