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

/// Whenever so much of a drive has passed, the application refreshes the display.
inline constexpr microseconds kRefresh = std::chrono::seconds(2);

/// The messages of a scenario's first technology, made while they are asked for.
class Drive {
public:
    explicit Drive(const Scenario& scenario);

    /// Nothing at the end, and where the technology changes.
    std::optional<Source::Message> next();

private:
    PropertyListCodec _lists;
    std::unique_ptr<Source> _source;
    std::string_view _technology;
};

/// So much of it, in memory: what is measured is then the decoding alone.
std::vector<Source::Message> driven(const Scenario& scenario, std::chrono::minutes time);

/// The real generator on its shipped template.
class Decoding {
public:
    explicit Decoding(std::string_view technology);

    void receive(Bytes message) { _generator->updateState(state, message); }
    /// The display, and its tree.
    void refresh();

    State state;

private:
    Surroundings _surroundings;
    std::unique_ptr<LogGenerator> _generator;
};

} // namespace kestrum::bench
