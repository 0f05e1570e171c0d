#pragma once

#include "support/Date.h"
#include "voxd/Source.h"

#include <cstdint>
#include <memory>
#include <span>
#include <string_view>

namespace kestrum {

class PropertyLists;

/// What a scenario is made from. Equal seeds and starts give equal messages.
struct ScenarioSetting {
    std::uint64_t seed;
    Date start;           ///< the moment of offset 0: records are stamped with it
    PropertyLists& lists; ///< outlives the source
};

/// A simulated drive through a small network.
struct Scenario {
    std::string_view name;       ///< as the command line has it: "ifx"
    std::string_view technology; ///< kVoxLogChannelTechnology_...: of its first message
    std::string_view summary;    ///< one line for the help text

    std::unique_ptr<Source> (*make)(const ScenarioSetting& setting);
};

/// All of them, in the order of the help text.
std::span<const Scenario> scenarios();

/// Null when there is none of that name.
std::unique_ptr<Source> makeScenario(std::string_view name, const ScenarioSetting& setting);

} // namespace kestrum
