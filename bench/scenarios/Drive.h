#pragma once

#include "LogGenerator/LogGenerator.h"
#include "decoding/Messages.h"
#include "voxd/scenarios/Scenario.h"

#include <chrono>
#include <cstdint>
#include <memory>
#include <vector>

namespace kestrum::bench {

using std::chrono::microseconds;

/// The application refreshes the display each time this much of a drive has passed.
inline constexpr microseconds kRefresh = std::chrono::seconds(2);

/// The messages of a scenario's first technology, generated on request.
class Drive {
public:
    explicit Drive(const Scenario& scenario);

    /// Empty at the end, and where the technology changes.
    std::optional<Source::Message> next();

private:
    PropertyListCodec _lists;
    std::unique_ptr<Source> _source;
    std::string_view _technology;
};

/// The first `time` of a scenario, in memory, so that only the decoding is measured.
std::vector<Source::Message> driven(const Scenario& scenario, std::chrono::minutes time);

/// The real generator with its shipped template.
class Decoding {
public:
    explicit Decoding(std::string_view technology);

    void receive(Bytes message) { _generator->updateState(state, message); }
    /// Updates the display and its tree.
    void refresh();

    State state;

private:
    Surroundings _surroundings;
    std::unique_ptr<LogGenerator> _generator;
};

} // namespace kestrum::bench
