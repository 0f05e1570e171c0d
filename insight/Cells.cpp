#include "insight/Cells.h"

#include <algorithm>
#include <iterator>

namespace kestrum {

void VisitedCell::count(std::optional<Date> at, std::optional<Date> from)
{
    if (at && since)
        time += std::max(*at - *since, std::chrono::microseconds(0)); // clocks jump back
    if (at)
        lastSeen = at;
    since = from;
}

VisitedCell& Cells::enter(std::string_view radio, std::string key, std::optional<Date> at)
{
    const auto [known, isNew] = _places.try_emplace({radio, key}, _cells.end());
    if (isNew) {
        _cells.push_front({});
        _cells.front().radio = radio;
        _cells.front().key = std::move(key);
        known->second = _cells.begin();
    } else {
        _cells.splice(_cells.begin(), _cells, known->second);
    }
    auto& cell = _cells.front();
    ++cell.visits;
    cell.isServing = true;
    cell.since = at;
    if (at)
        cell.lastSeen = at;
    if (_cells.size() > kMost)
        dropOldest();
    return cell;
}

void Cells::leave(VisitedCell& cell, std::optional<Date> at)
{
    cell.count(at, std::nullopt);
    cell.isServing = false;
}

// A cell of another radio may have served for a long time.
void Cells::dropOldest()
{
    const auto oldest = std::find_if(_cells.rbegin(), _cells.rend(), [](const auto& cell) { return !cell.isServing; });
    if (oldest == _cells.rend())
        return;
    _places.erase({oldest->radio, oldest->key});
    _cells.erase(std::prev(oldest.base()));
    ++_dropped;
}

} // namespace kestrum
