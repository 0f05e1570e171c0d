#include "insight/CellSheet.h"

#include "insight/History.h"
#include "insight/LocalTime.h"
#include "insight/NumberIn.h"
#include "platform/Clock.h"
#include "support/Format.h"

#include <algorithm>
#include <chrono>
#include <string>
#include <utility>

namespace kestrum {
namespace {

SheetTable cellTable()
{
    return {.columns = {{.heading = "Cell", .isIdentity = true},
                        {.heading = "Visits", .isNumeric = true},
                        {.heading = "Time on it", .isNumeric = true},
                        {.heading = "Least", .isNumeric = true},
                        {.heading = "Mean", .isNumeric = true},
                        {.heading = "Greatest", .isNumeric = true},
                        {.heading = "Last seen"}}};
}

/// "12.3 s", "5:12 min", "2:05 h"
std::string timeText(std::chrono::microseconds time)
{
    using namespace std::chrono;
    const auto seconds = static_cast<long>(duration_cast<std::chrono::seconds>(time).count());
    if (seconds < 60)
        return formatted("%.1f s", duration<double>(time).count());
    if (seconds < 3600)
        return formatted("%ld:%02ld min", seconds / 60, seconds % 60);
    return formatted("%ld:%02ld h", seconds / 3600, seconds / 60 % 60);
}

} // namespace

CellSheet::CellSheet(History& history, const Clock& clock) : _history(history), _clock(clock)
{
    _contents.title = "Cells";
    _contents.hint = "No cell has served yet.";
}

bool CellSheet::update(const Shown&)
{
    const auto& cells = _history.cells();
    _contents.parts.clear();
    if (cells.size() == 0)
        return true;
    SheetPart part{.table = cellTable()};
    const auto today = dayText(_clock, _clock.now());
    for (const auto& cell : cells) {
        if (part.table.rows.size() == kMostRows)
            break;
        const auto level = [&cell](double (Spread::*number)() const) {
            return cell.level.count() != 0 ? withUnit(shortText((cell.level.*number)()), cell.unit) : std::string();
        };
        part.table.rows.push_back({.identity = formatted("%@ %@", cell.radio, cell.key),
                                   .cells = {{formatted("%@ %@", cell.radio, cell.identity)},
                                             {std::to_string(cell.visits)},
                                             {timeText(cell.time)},
                                             {level(&Spread::least)},
                                             {level(&Spread::mean)},
                                             {level(&Spread::greatest)},
                                             {cell.lastSeen ? momentText(_clock, *cell.lastSeen, today) : ""}},
                                   .isReference = cell.isServing});
    }
    std::ranges::stable_partition(part.table.rows, &SheetRow::isReference);
    if (part.table.rows.size() < cells.size())
        part.note = formatted("%lu of %lu cells are shown.", part.table.rows.size(), cells.size());
    if (cells.dropped() != 0)
        part.note += formatted("%s%lu older ones are no longer listed.", part.note.empty() ? "" : " ", cells.dropped());
    _contents.parts.push_back(std::move(part));
    return true;
}

} // namespace kestrum
