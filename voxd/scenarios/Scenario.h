#pragma once

#include "support/Date.h"
#include "voxd/Source.h"

#include <cstdint>
#include <memory>
#include <span>
#include <string_view>

namespace kestrum {

class PropertyLists;

/// The parameters of a scenario. Equal seeds and starts give equal messages.
struct ScenarioSetting {
    std::uint64_t seed;
    Date start;           ///< the moment of offset 0, used for the records' time stamps
    PropertyLists& lists; ///< outlives the source
};

/// A simulated drive through a small network.
struct Scenario {
    std::string_view name;       ///< its name on the command line: "ifx"
    std::string_view technology; ///< kVoxLogChannelTechnology_... of its first message
    std::string_view summary;    ///< one line for the help text

    std::unique_ptr<Source> (*make)(const ScenarioSetting& setting);
};

/// All scenarios, in the order of the help text.
std::span<const Scenario> scenarios();

/// Null when no scenario has that name.
std::unique_ptr<Source> makeScenario(std::string_view name, const ScenarioSetting& setting);

} // namespace kestrum
