#pragma once

#include "LogGenerator/LogGenerator.h"
#include "core/KestrumModelNode.h"
#include "decoding/Messages.h"
#include "insight/Events.h"
#include "voxd/scenarios/Scenario.h"

#include <chrono>
#include <memory>
#include <optional>
#include <span>
#include <string_view>
#include <vector>

namespace kestrum::bench {

using std::chrono::microseconds;

/// The application refreshes the display each time this much of a drive has passed.
inline constexpr microseconds kRefresh = std::chrono::seconds(2);

/// A scenario from its beginning. Always the same messages. `lists` is borrowed.
std::unique_ptr<Source> begin(const Scenario& scenario, PropertyLists& lists);

/// The first `time` of a scenario, in memory, so that only the decoding is measured. Ends where the technology changes.
std::vector<Source::Message> driven(const Scenario& scenario, std::chrono::minutes time);

/// The same messages in parts of `kRefresh` each.
std::vector<std::span<const Source::Message>> betweenRefreshes(const std::vector<Source::Message>& messages);

/// The real generator with its shipped template.
class Decoding {
public:
    explicit Decoding(std::string_view technology);

    /// Lets every line of the system log be formatted, not the errors alone.
    void logEverything() { _surroundings.log.everything = true; }
    /// Continues on the same state with another generator.
    void changeTo(std::string_view technology);

    /// Finds the events too, as an application that shows them.
    void findEvents() { _events.emplace(); }

    void receive(Bytes message)
    {
        _generator->updateState(_state, message);
        if (_events)
            _events->look(*_generator, _state, message);
    }
    /// Updates the display and makes its tree.
    KestrumModelNodeRef refresh(PathDictionary& paths);
    void refresh();

    /// Makes every list of the display as long, and every row as wide, as they can get. The readings depend on
    /// `round`, so that each round changes every text.
    void fill(unsigned round);

private:
    Surroundings _surroundings;
    std::unique_ptr<LogGenerator> _generator;
    State _state;
    std::optional<EventFinder> _events;
};

} // namespace kestrum::bench
