#pragma once

#include "support/Date.h"
#include "voxd/Source.h"

#include <cstdint>
#include <memory>
#include <span>
#include <string_view>
#include <vector>

namespace kestrum {

class PropertyLists;

/// The parameters of a scenario. Equal seeds and starts give equal messages.
struct ScenarioSetting {
    std::uint64_t seed;
    Date start;           ///< the moment of offset 0, used for the records' time stamps
    PropertyLists& lists; ///< outlives the source
};

/// The cell that serves the simulated phone over one radio access.
struct ScenarioCell {
    std::string_view radio; ///< "LTE", "GSM", "UMTS", "TD-SCDMA", "1x", "EV-DO"
    std::int64_t identity;  ///< the cell identity; 1x: the base station; EV-DO: the pilot's offset

    friend bool operator==(const ScenarioCell&, const ScenarioCell&) = default;
};

/// The log of a scenario, which also knows what a reader of the log has to find out.
class ScenarioSource : public Source {
public:
    /// The cells that serve when the last message of `next` was written. CDMA has one for calls and one for data.
    virtual std::vector<ScenarioCell> servingCells() const = 0;
};

/// A simulated drive through a small network.
struct Scenario {
    std::string_view name;       ///< its name on the command line: "ifx"
    std::string_view technology; ///< kVoxLogChannelTechnology_... of its first message
    std::string_view summary;    ///< one line for the help text

    std::unique_ptr<ScenarioSource> (*make)(const ScenarioSetting& setting);
};

/// All scenarios, in the order of the help text.
std::span<const Scenario> scenarios();

/// Null when no scenario has that name.
std::unique_ptr<ScenarioSource> makeScenario(std::string_view name, const ScenarioSetting& setting);

} // namespace kestrum
