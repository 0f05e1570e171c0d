#include "insight/History.h"

#include "platform/Clock.h"

namespace kestrum {

void History::displayMade(const Dictionary& entry)
{
    _moments.displayMade(entry);
    const auto newest = _moments.newest();
    _trends.sample(newest->display(), _technology, newest->time);
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
