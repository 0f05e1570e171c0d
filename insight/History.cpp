#include "insight/History.h"

#include "LogGenerator/State.h"
#include "platform/Clock.h"

#include <algorithm>
#include <utility>

namespace kestrum {

void History::displayMade(const Dictionary& entry)
{
    _moments.displayMade(entry);
    const auto newest = _moments.newest(); // none when even this display was too large
    const Date now = newest ? newest->time : _clock.now();
    _trends.sample(entry.at(StateKey::kDisplay), _technology, now);
    markCellChanges(now);
}

void History::markCellChanges(Date now)
{
    const auto& events = _finder.events();
    const auto all = events.dropped() + events.size();
    const auto fresh = std::min<std::uint64_t>(all - std::exchange(_marked, all), events.size());
    if (std::any_of(events.end() - static_cast<std::ptrdiff_t>(fresh), events.end(), isCellChange))
        _cellChanges.push_back(now);
    if (_cellChanges.size() > kMostCellChanges)
        _cellChanges.pop_front();
}

void History::messageDecoded(const LogGenerator& generator, const State& state, Bytes message)
{
    _quiet = {};
    if (_technology != generator.technology()) {
        _technology = generator.technology();
        _recent.clear();
    }
    _recent.add(message);
    _finder.look(generator, state, message);
}

void History::connectionChanged(bool isConnected)
{
    _quiet = {};
    _finder.connected(isConnected, _clock.now());
}

void History::timePassed(std::chrono::milliseconds time)
{
    _recent.turn();
    _quiet += time;
    if (_quiet > EventFinder::kSilence) // above: a message may come shortly before the first of these calls
        _finder.silent();
}

} // namespace kestrum
