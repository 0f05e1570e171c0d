#include "frontends/terminal/Plot.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <utility>

namespace kestrum::terminal {

namespace {

constexpr int kLeastColumns = 8;     // of a curve: words, then numbers, make way for it
constexpr std::size_t kDotEvery = 4; // columns, of the line where a band begins
constexpr int kLeastText = 3;        // columns, of a mark's text
constexpr Style kCurve{.colour = Colour::Accent}, kChosen{.bold = true, .reverse = true};

int columnOf(double place, int columns)
{
    if (!(place > 0)) // not a number, too
        return 0;
    return std::min(static_cast<int>(std::min(place, 1.0) * columns), columns - 1);
}

/// The value's height in the plot, 0 to 1.
double heightOf(const SheetPlot& plot, double value)
{
    const double height = (value - plot.bottom) / (plot.top - plot.bottom);
    return height > 0 ? std::min(height, 1.0) : 0; // 0 for an axis without length
}

/// The row of a line that begins at this height; row 0 is the top.
int rowOf(double height, int rows)
{
    return rows - 1 - std::min(static_cast<int>(height * rows), rows - 1);
}

/// What one column of dots shows. Heights are 0 to 1.
struct Stroke {
    double low, high;
    bool isJoined; ///< with the column at the left
};
using Strokes = std::vector<std::optional<Stroke>>;

Strokes strokesOf(const SheetPlot& plot, int columns)
{
    Strokes strokes(static_cast<std::size_t>(columns));
    struct End {
        int column;
        double height;
    };
    End before{};
    bool isJoined = false; // with `before`
    for (const auto& [at, least, mean, greatest] : plot.points) {
        if (!std::isfinite(at) || !std::isfinite(mean)) {
            isJoined = false;
            continue;
        }
        const End now{columnOf(at, columns), heightOf(plot, mean)};
        const double low = std::isfinite(least) ? std::min(heightOf(plot, least), now.height) : now.height;
        const double high = std::isfinite(greatest) ? std::max(heightOf(plot, greatest), now.height) : now.height;
        for (int each = before.column + 1; isJoined && each < now.column; ++each) {
            const double part = static_cast<double>(each - before.column) / (now.column - before.column);
            const double height = std::lerp(before.height, now.height, part);
            strokes[static_cast<std::size_t>(each)] = {height, height, true};
        }
        auto& stroke = strokes[static_cast<std::size_t>(now.column)];
        if (stroke)
            stroke = {std::min(stroke->low, low), std::max(stroke->high, high), stroke->isJoined};
        else
            stroke = {low, high, isJoined};
        before = now;
        isJoined = true;
    }
    return strokes;
}

/// A stroke in whole steps from the bottom.
struct Levels {
    int low, high;
};

Levels levelsOf(const Stroke& stroke, int steps)
{
    const auto level = [&](double height) { return std::min(static_cast<int>(height * steps), steps - 1); };
    return {level(stroke.low), level(stroke.high)};
}

std::vector<std::wstring> brailleCurve(const Strokes& strokes, int columns, int rows)
{
    constexpr wchar_t kNoDots = 0x2800;
    // from the top, in the left and the right half of a character
    constexpr wchar_t kDots[2][4] = {{0x01, 0x02, 0x04, 0x40}, {0x08, 0x10, 0x20, 0x80}};
    std::vector<std::wstring> lines(static_cast<std::size_t>(rows),
                                    std::wstring(static_cast<std::size_t>(columns), kNoDots));
    std::optional<Levels> before;
    for (std::size_t x = 0; x < strokes.size(); ++x) {
        if (!strokes[x]) {
            before.reset();
            continue;
        }
        const auto own = levelsOf(*strokes[x], 4 * rows);
        auto drawn = own;
        if (before && strokes[x]->isJoined) {
            drawn.low = std::min(drawn.low, before->high + 1);
            drawn.high = std::max(drawn.high, before->low - 1);
        }
        for (int level = drawn.low; level <= drawn.high; ++level) {
            const auto fromTop = static_cast<std::size_t>(4 * rows - 1 - level);
            lines[fromTop / 4][x / 2] |= kDots[x % 2][fromTop % 4];
        }
        before = own;
    }
    for (auto& line : lines)
        std::ranges::replace(line, kNoDots, L' ');
    return lines;
}

/// The character of each row that a stroke crosses: `charOf(levels, base)`, where `base` is the row's lowest level.
template <typename CharOf>
std::vector<std::wstring> curveOf(const Strokes& strokes, int rows, int steps, CharOf charOf)
{
    std::vector<std::wstring> lines(static_cast<std::size_t>(rows), std::wstring(strokes.size(), L' '));
    for (std::size_t x = 0; x < strokes.size(); ++x) {
        if (!strokes[x])
            continue;
        const auto levels = levelsOf(*strokes[x], steps * rows);
        for (int row = levels.low / steps; row <= levels.high / steps; ++row)
            lines[static_cast<std::size_t>(rows - 1 - row)][x] = charOf(levels, steps * row);
    }
    return lines;
}

wchar_t blockOf(const Levels& levels, int base)
{
    constexpr std::wstring_view kEighths = L"▁▂▃▄▅▆▇█";
    return kEighths[static_cast<std::size_t>(std::min(levels.high - base, 7))];
}

wchar_t asciiOf(const Levels& levels, int base)
{
    if (levels.low < base || levels.high > base + 2)
        return L'|';
    return L"_-'"[(levels.low + levels.high) / 2 - base];
}

/// Cells with their styles, to be put on a line as pieces.
class CellLine {
public:
    explicit CellLine(const std::wstring& text) : _text(text), _styles(text.size(), kCurve) {}

    bool isEmpty(std::size_t at) const { return _text[at] == L' '; }
    void set(std::size_t at, wchar_t c, Style style)
    {
        _text[at] = c;
        _styles[at] = style;
    }
    void restyle(std::size_t at, Style style) { _styles[at] = style; }

    void addTo(Pieces& pieces, int column) const
    {
        for (std::size_t from = 0, to = 0; from < _text.size(); from = to) {
            while (to < _text.size() && _styles[to] == _styles[from])
                ++to;
            pieces.push_back({column + static_cast<int>(from), utf8(_text.substr(from, to - from)), _styles[from]});
        }
    }

private:
    std::wstring _text;
    std::vector<Style> _styles;
};

bool isStrip(const SheetPlot& plot)
{
    return plot.points.empty() && !plot.spans.empty();
}

std::size_t sizeOf(const SheetPlot& plot)
{
    return isStrip(plot) ? plot.spans.size() : plot.points.size();
}

double placeOf(const SheetPlot& plot, std::size_t index)
{
    return isStrip(plot) ? plot.spans[index].from : plot.points[index].at;
}

int widestOf(const std::vector<std::string>& texts)
{
    int widest = 0;
    for (const auto& each : texts)
        widest = std::max(widest, columns(each));
    return widest;
}

bool hasRoom(const std::string& text, int room)
{
    return room >= std::min(kLeastText, columns(text));
}

/// A band's word, and the rows where the band begins and where the word stands: there, or above another word.
struct Word {
    int begin, row;
    const std::string* text;
    bool hasLine; ///< the band begins inside the plot
};

std::vector<Word> wordsOf(const SheetPlot& plot, int rows)
{
    std::vector<Word> words;
    int free = rows - 1; // the lowest row without a word
    for (std::size_t i = 0; i < plot.bands.size(); ++i) {
        const auto& [least, word] = plot.bands[i];
        const bool isBelow = i + 1 < plot.bands.size() && plot.bands[i + 1].least <= plot.bottom;
        if (isBelow || least > plot.top)
            continue;
        const int begin = rowOf(heightOf(plot, least), rows);
        const int row = std::min(begin, free);
        // Above its band a word would be wrong.
        const int end = i + 1 < plot.bands.size() ? rowOf(heightOf(plot, plot.bands[i + 1].least), rows) : 0;
        if (row < end)
            continue;
        words.push_back({begin, row, &word, least > plot.bottom});
        free = row - 1;
    }
    return words;
}

/// Draws one part of a plot after the other, from the top.
class PlotDrawing {
public:
    PlotDrawing(const SheetPlot& plot, PlotMarks marks, int columns, int rows)
        : _plot(plot), _marks(marks), _width(columns), _rows(std::max(rows, 1))
    {}

    PlotPicture draw()
    {
        placeCells();
        addTop();
        _picture.cells.row = static_cast<int>(_picture.lines.size());
        isStrip(_plot) ? addStrip() : addCurve();
        addMarks();
        addTimes();
        for (const auto& each : wrapped(_plot.sentence, _width - 2 * kInset)) {
            if (_picture.reading < 0)
                _picture.reading = static_cast<int>(_picture.lines.size());
            _picture.lines.push_back({{kInset, each, {}}});
        }
        return std::move(_picture);
    }

private:
    void placeCells()
    {
        std::vector<std::string> words;
        words.reserve(_plot.bands.size());
        for (const auto& each : _plot.bands)
            words.push_back(each.word);
        const int all = std::max(_width - 2 * kInset, 1);
        _numbers = widestOf(_plot.numbers) + (_plot.numbers.empty() ? 0 : 1);
        _words = widestOf(words) + (words.empty() ? 0 : 1);
        if (isStrip(_plot))
            _numbers = _words = 0;
        if (all - _numbers - 1 - _words < kLeastColumns)
            _words = 0;
        if (all - _numbers - 1 < kLeastColumns)
            _numbers = 0;
        const int axis = isStrip(_plot) || all < kLeastColumns ? 0 : 1;
        _picture.cells.column = kInset + _numbers + axis;
        _picture.cells.columns = std::max(all - _numbers - axis - _words, 1);
        _picture.cells.rows = isStrip(_plot) ? 1 : _rows;
    }

    /// The ranges, and the reading beside them or below.
    void addTop()
    {
        Pieces top;
        int at = kInset;
        for (std::size_t i = 0; i < _plot.ranges.size(); ++i) {
            _picture.ranges.push_back(at);
            top.push_back({at, _plot.ranges[i], i == _plot.range ? kChosen : kDim});
            at += columns(_plot.ranges[i]) + kGap;
        }
        if (!_plot.reading.empty()) {
            const int begin = _width - kInset - columns(_plot.reading);
            if (!top.empty() && begin < at)
                _picture.lines.push_back(std::exchange(top, {}));
            if (_plot.cursor)
                _picture.reading = static_cast<int>(_picture.lines.size());
            top.push_back({top.empty() ? kInset : begin,
                           cutAtTheEnd(_plot.reading, _width - 2 * kInset),
                           {.bold = _plot.cursor.has_value()}});
        }
        if (!top.empty())
            _picture.lines.push_back(std::move(top));
    }

    void addStrip()
    {
        auto pieces = strip(_plot, _picture.cells.columns);
        for (auto& each : pieces)
            each.column += _picture.cells.column;
        _picture.lines.push_back(std::move(pieces));
    }

    void addCurve()
    {
        const int width = _picture.cells.columns;
        std::vector<CellLine> cells;
        for (const auto& each : curve(_plot, _marks, width, _rows))
            cells.emplace_back(each);
        std::vector<Pieces> lines(cells.size());
        for (const auto& [begin, row, text, hasLine] : wordsOf(_plot, _rows)) {
            auto& line = cells[static_cast<std::size_t>(begin)];
            for (std::size_t x = 0; hasLine && x < static_cast<std::size_t>(width); x += kDotEvery)
                if (line.isEmpty(x))
                    line.set(x, L'·', kDim);
            if (_words > 0)
                lines[static_cast<std::size_t>(row)].push_back({_picture.cells.column + width + 1, *text, {}});
        }
        if (_plot.cursor && *_plot.cursor < _plot.points.size()) {
            const auto x = static_cast<std::size_t>(columnOf(_plot.points[*_plot.cursor].at, width));
            for (auto& each : cells)
                each.isEmpty(x) ? each.set(x, L'│', {.bold = true}) : each.restyle(x, kChosen);
        }
        for (std::size_t i = 0; i < cells.size(); ++i) {
            if (_picture.cells.column > kInset)
                lines[i].push_back({_picture.cells.column - 1, "│", kDim});
            cells[i].addTo(lines[i], _picture.cells.column);
        }
        if (_numbers > 0)
            addNumbers(lines);
        std::ranges::move(lines, std::back_inserter(_picture.lines));
    }

    void addNumbers(std::vector<Pieces>& lines) const
    {
        const std::size_t count = _plot.numbers.size(), last = lines.size() - 1;
        int above = static_cast<int>(last) + 1; // no number stands on another
        for (std::size_t i = 0; i < count; ++i) {
            const auto row = static_cast<int>(count > 1 ? last - i * last / (count - 1) : last);
            if (row >= above)
                continue;
            above = row;
            const auto& number = _plot.numbers[i];
            lines[static_cast<std::size_t>(row)].push_back({_picture.cells.column - 2 - columns(number), number, kDim});
        }
    }

    /// What changed, under the place where it did.
    void addMarks()
    {
        Pieces line;
        const auto [row, column, rows, width] = _picture.cells;
        for (std::size_t i = 0; i < _plot.marks.size(); ++i) {
            const auto& [at, text] = _plot.marks[i];
            if (!std::isfinite(at))
                continue;
            const int begin = columnOf(at, width);
            const int end = i + 1 < _plot.marks.size() ? columnOf(_plot.marks[i + 1].at, width) - 1 : width;
            line.push_back({column + begin, "↑", {}});
            if (hasRoom(text, end - begin - 1))
                line.push_back({column + begin + 1, cutAtTheEnd(text, end - begin - 1), {}});
        }
        if (!line.empty())
            _picture.lines.push_back(std::move(line));
    }

    /// The first at the left end, the last at the right end, those between where there is room.
    void addTimes()
    {
        Pieces line;
        const auto [row, column, rows, width] = _picture.cells;
        const std::size_t count = _plot.times.size();
        int free = column, end = column + width;
        for (std::size_t i = 0; i < count; ++i) {
            const std::size_t index = i == 0 ? 0 : i == 1 ? count - 1 : i - 1; // both ends first
            const auto& time = _plot.times[index];
            const int wanted = columns(time);
            const auto part = count > 1 ? static_cast<double>(index) / static_cast<double>(count - 1) : 0;
            const int begin = column + static_cast<int>(std::lround(part * (width - wanted)));
            if (begin < free || begin + wanted > end)
                continue;
            line.push_back({begin, time, kDim});
            if (index == count - 1 && count > 1)
                end = begin - 1;
            else
                free = begin + wanted + 1;
        }
        if (!line.empty())
            _picture.lines.push_back(std::move(line));
    }

    const SheetPlot& _plot;
    const PlotMarks _marks;
    const int _width, _rows;
    int _numbers = 0, _words = 0; // columns, with the gap to the curve; 0 without room
    PlotPicture _picture;
};

} // namespace

PlotMarks choosePlotMarks(Charset charset, std::string_view terminal, std::string_view asked)
{
    if (charset == Charset::Ascii || asked == "ascii")
        return PlotMarks::Ascii;
    if (asked == "braille")
        return PlotMarks::Braille;
    // The fonts of the Linux console have no braille.
    return asked == "blocks" || terminal.starts_with("linux") ? PlotMarks::Blocks : PlotMarks::Braille;
}

PlotMarks choosePlotMarks(Charset charset)
{
    const auto variable = [](const char* name) {
        const char* value = std::getenv(name);
        return std::string_view(value ? value : "");
    };
    return choosePlotMarks(charset, variable("TERM"), variable("KESTRUM_PLOT"));
}

std::vector<std::wstring> curve(const SheetPlot& plot, PlotMarks marks, int columns, int rows)
{
    if (columns < 1 || rows < 1)
        return {};
    if (marks == PlotMarks::Braille)
        return brailleCurve(strokesOf(plot, 2 * columns), columns, rows);
    const auto strokes = strokesOf(plot, columns);
    return marks == PlotMarks::Blocks ? curveOf(strokes, rows, 8, blockOf) : curveOf(strokes, rows, 3, asciiOf);
}

Pieces strip(const SheetPlot& plot, int columns)
{
    Pieces pieces;
    int free = 0; // the first column without a span
    for (std::size_t i = 0; i < plot.spans.size(); ++i) {
        const auto& [from, to, text] = plot.spans[i];
        if (!std::isfinite(from) || !std::isfinite(to))
            continue;
        // A short span takes a column from the next one, so that it is seen. Of several in one column, the first is.
        const int begin = std::max(columnOf(from, columns), free);
        if (begin > columnOf(to, columns)) {
            if (plot.cursor == i && !pieces.empty())
                pieces.back().style = kChosen;
            continue;
        }
        const int end = std::max(to < 1 ? columnOf(to, columns) : columns, begin + 1);
        const int room = end - begin - 1;
        std::string shown = "│" + (hasRoom(text, room) ? cutAtTheEnd(text, room) : "");
        for (int at = terminal::columns(shown); at < end - begin; ++at)
            shown += "─";
        pieces.push_back({begin, std::move(shown), plot.cursor == i ? kChosen : Style{}});
        free = end;
    }
    return pieces;
}

PlotPicture draw(const SheetPlot& plot, PlotMarks marks, int columns, int rows)
{
    return PlotDrawing(plot, marks, columns, rows).draw();
}

std::optional<std::size_t> pointAt(const SheetPlot& plot, int column, int columns)
{
    std::optional<std::size_t> nearest;
    int least = 0;
    for (std::size_t i = 0; i < sizeOf(plot); ++i) {
        const int here = columnOf(placeOf(plot, i), columns);
        if (isStrip(plot) && here > column)
            break;
        const int distance = std::abs(here - column);
        if (!nearest || distance <= least) {
            nearest = i;
            least = distance;
        }
    }
    return nearest;
}

std::optional<std::size_t> pointBeside(const SheetPlot& plot, bool isAfter, int columns)
{
    const std::size_t count = sizeOf(plot);
    if (count == 0)
        return std::nullopt;
    const std::size_t now = plot.cursor ? std::min(*plot.cursor, count - 1) : count - 1;
    const auto column = [&](std::size_t index) { return columnOf(placeOf(plot, index), columns); };
    for (std::size_t to = now; isAfter ? ++to < count : to-- > 0;)
        if (columns == 0 || column(to) != column(now))
            return to;
    return isAfter ? std::nullopt : std::optional<std::size_t>(0);
}

} // namespace kestrum::terminal
