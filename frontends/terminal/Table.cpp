#include "frontends/terminal/Table.h"

#include <algorithm>
#include <utility>

namespace kestrum::terminal {

namespace {

constexpr std::ptrdiff_t kWheelRows = 3;
constexpr int kSidewaysColumns = 8;
constexpr auto kNowhere = static_cast<std::size_t>(-1);

// makeCell creates every cell, so the cast is safe.
TerminalCell& terminalCell(ReusableCell& reusable)
{
    return static_cast<TerminalCell&>(reusable.cell());
}

} // namespace

void TerminalTable::reloadData()
{
    _loaded = false;
    _repaint.repaintLater();
}

std::shared_ptr<ReusableCell> TerminalTable::dequeueReusableCell(std::string_view reuseIdentifier)
{
    return _offered && _offered->reuseIdentifier() == reuseIdentifier ? _offered : nullptr;
}

std::unique_ptr<TableCell> TerminalTable::makeCell(CellStyle style)
{
    return std::make_unique<TerminalCell>(style, _area.columns);
}

std::shared_ptr<ReusableCell> TerminalTable::cellFor(std::size_t row)
{
    const auto found = _cells.find(row);
    _offered = found == _cells.end() ? nullptr : found->second;
    const auto before = _offered ? terminalCell(*_offered).accessory() : Accessory::None;
    if (_offered)
        terminalCell(*_offered).setColumns(_area.columns);
    auto cell = _source.cellForRowAtIndexPath(*this, {0, row});
    // The row is of the other kind now, which this cell cannot show. It needs a new cell.
    if (cell == _offered && terminalCell(*cell).accessory() != before) {
        _offered = nullptr;
        cell = _source.cellForRowAtIndexPath(*this, {0, row});
    }
    _offered = nullptr;
    return cell;
}

void TerminalTable::load()
{
    const bool anew = !_loaded;
    if (anew) {
        _rows = _source.numberOfRowsInSection(*this, 0);
        followChosen();
    }
    if (_chosenInSight && _rows > 0) {
        const auto at = chosen();
        if (at < top())
            _top = at;
        else if (height() > 0 && at >= top() + height())
            _top = at - height() + 1;
    }
    std::map<std::size_t, std::shared_ptr<ReusableCell>> cells;
    for (std::size_t row = top(); row < std::min(_rows, top() + height()); ++row) {
        if (_loaded && _cells.contains(row)) {
            cells[row] = _cells[row];
            continue;
        }
        cells[row] = cellFor(row);
        auto& cell = terminalCell(*cells[row]);
        const auto moved = _sideways.find(cell.name());
        cell.setSideways(moved == _sideways.end() ? 0 : moved->second);
    }
    _cells = std::move(cells);
    _loaded = true;
    if (anew)
        rememberChosen();
}

void TerminalTable::followChosen()
{
    if (_rows == 0)
        return;
    for (const auto& each : _heirs)
        if (const auto row = find(each)) {
            // When rows are added or removed above it, the chosen row keeps its line, unless the table shows its
            // first row.
            if (top() > 0 && _chosen < top() + height())
                _top = std::max(*row + _top, _chosen) - _chosen;
            _chosen = *row;
            return;
        }
}

void TerminalTable::rememberChosen()
{
    if (_rows == 0)
        return;
    const auto at = chosen();
    _heirs = {placeOf(at)};
    if (at + 1 < _rows)
        _heirs.push_back(placeOf(at + 1));
    if (at > 0)
        _heirs.push_back(placeOf(at - 1));
}

TerminalTable::Place TerminalTable::placeOf(std::size_t row)
{
    return {row, nameOf(row)};
}

std::optional<std::size_t> TerminalTable::find(const Place& place)
{
    for (std::size_t distance = 0; distance <= std::max(place.row, _rows); ++distance)
        // a row below 0 wraps to a number far beyond the last
        for (const auto row : {place.row + distance, place.row - distance})
            if (row < _rows && nameOf(row) == place.name)
                return row;
    return std::nullopt;
}

void TerminalTable::draw(Screen& screen, Area area, bool focused)
{
    if (area.columns != _area.columns)
        _loaded = false;
    _area = area;
    load();
    for (const auto& [row, cell] : _cells) {
        const int at = area.row + static_cast<int>(row - top());
        const Line line(screen, at, area.column, area.columns);
        terminalCell(*cell).draw(focused && row == chosen() ? line.chosen() : line);
    }
}

bool TerminalTable::handle(const Input& input)
{
    const auto page = static_cast<std::ptrdiff_t>(std::max<std::size_t>(height(), 2) - 1);
    switch (input.key) {
    case Key::Up:
        move(-1);
        return true;
    case Key::Down:
        move(1);
        return true;
    case Key::PageUp:
        move(-page);
        return true;
    case Key::PageDown:
        move(page);
        return true;
    case Key::Home:
        choose(std::size_t{0});
        return true;
    case Key::End:
        choose(_rows - std::min<std::size_t>(_rows, 1));
        return true;
    case Key::WheelUp:
        scroll(-kWheelRows);
        return true;
    case Key::WheelDown:
        scroll(kWheelRows);
        return true;
    case Key::Enter:
    case Key::Right:
        return open(chosen());
    case Key::ShiftLeft:
    case Key::ShiftRight:
        if (const auto found = _cells.find(chosen()); found != _cells.end()) {
            auto& cell = terminalCell(*found->second);
            cell.setSideways(cell.sideways() + (input.key == Key::ShiftLeft ? -kSidewaysColumns : kSidewaysColumns));
            if (cell.sideways() > 0)
                _sideways[cell.name()] = cell.sideways();
            else
                _sideways.erase(cell.name());
        }
        _repaint.repaintLater();
        return true;
    case Key::Press:
        _pressed.reset();
        if (const auto row = rowAt(input); row < _rows) {
            _pressed = placeOf(row);
            choose(row);
        }
        return _pressed.has_value();
    case Key::Release: {
        // A refresh may have moved another row there.
        const auto pressed = std::exchange(_pressed, std::nullopt);
        const auto row = rowAt(input);
        return pressed && row < _rows && find(*pressed) == row && open(row);
    }
    default:
        return false;
    }
}

bool TerminalTable::open(std::size_t row)
{
    load(); // a row that was removed since it was shown opens nothing
    if (row >= _rows)
        return false;
    _source.didSelectRowAtIndexPath(*this, IndexPath{0, row});
    return true;
}

bool TerminalTable::choose(std::string_view part, std::size_t from)
{
    for (std::size_t i = 0; i < _rows; ++i) {
        const std::size_t row = (from + i) % _rows;
        if (!contains(nameOf(row), part))
            continue;
        choose(row);
        return true;
    }
    return false;
}

void TerminalTable::choose(std::size_t row)
{
    _chosen = row;
    rememberChosen();
    _chosenInSight = true;
    _repaint.repaintLater();
}

std::size_t TerminalTable::chosen() const
{
    return std::min(_chosen, _rows - std::min<std::size_t>(_rows, 1));
}

int TerminalTable::chosenLine() const
{
    return _area.row + static_cast<int>(chosen() - std::min(chosen(), top()));
}

std::string TerminalTable::position() const
{
    if (_rows <= height())
        return {};
    return std::to_string(chosen() + 1) + "/" + std::to_string(_rows);
}

std::string TerminalTable::nameOf(std::size_t row)
{
    if (const auto inSight = _cells.find(row); _loaded && inSight != _cells.end())
        return terminalCell(*inSight->second).name();
    _offered = _reader;
    _reader = _source.cellForRowAtIndexPath(*this, {0, row});
    _offered = nullptr;
    return terminalCell(*_reader).name();
}

void TerminalTable::move(std::ptrdiff_t rows)
{
    const auto last = static_cast<std::ptrdiff_t>(_rows) - 1;
    const auto to = static_cast<std::ptrdiff_t>(chosen()) + rows;
    choose(static_cast<std::size_t>(std::clamp(to, std::ptrdiff_t{0}, std::max(last, std::ptrdiff_t{0}))));
}

void TerminalTable::scroll(std::ptrdiff_t rows)
{
    _chosenInSight = false; // until the next key
    const auto furthest = static_cast<std::ptrdiff_t>(_rows) - static_cast<std::ptrdiff_t>(height());
    const auto to = static_cast<std::ptrdiff_t>(top()) + rows;
    _top = static_cast<std::size_t>(std::clamp(to, std::ptrdiff_t{0}, std::max(furthest, std::ptrdiff_t{0})));
    _repaint.repaintLater();
}

std::size_t TerminalTable::rowAt(const Input& mouse) const
{
    if (!_area.holds(mouse.row, mouse.column))
        return kNowhere;
    return top() + static_cast<std::size_t>(mouse.row - _area.row);
}

std::size_t TerminalTable::top() const
{
    return std::min(_top, _rows - std::min(_rows, height()));
}

} // namespace kestrum::terminal
