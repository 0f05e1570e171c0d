#pragma once

#include "platform/PropertyLists.h"
#include "voxd/scenarios/RecordWriter.h"
#include "voxd/scenarios/Scenario.h"

#include <chrono>
#include <string_view>
#include <utility>
#include <vector>

namespace kestrum {

/// Whether a record with a period of `period` ticks is logged in this tick. The periods start in different ticks.
constexpr bool isDue(unsigned tick, unsigned period)
{
    return tick % period == period / 2;
}

/// The records that a modem and its telephony service write during a tick, in order.
class ModemLog {
public:
    /// The lists must outlive the log.
    explicit ModemLog(PropertyLists& lists) : _lists(lists) {}

    void add(RecordWriter record) { _records.push_back(std::move(record)); }
    void add(LogCode code, const Value& propertyList);

    std::vector<RecordWriter> take() { return std::exchange(_records, {}); }

private:
    PropertyLists& _lists;
    std::vector<RecordWriter> _records;
};

/// A modem of one technology in the car. It receives the world's cells and logs its measurements and actions.
class Modem {
public:
    virtual ~Modem() = default;

    /// The duration of a tick, which is the shortest period of a record.
    static constexpr std::chrono::milliseconds kTick{10};
    /// Ticks per second.
    static constexpr unsigned kSecond = 100;
    /// Ticks per move of the world.
    static constexpr unsigned kMove = 10;
    static constexpr double kMoveSeconds = 0.1;

    /// kVoxLogChannelTechnology_...
    virtual std::string_view technology() const = 0;

    /// The cells that serve now.
    virtual std::vector<ScenarioCell> servingCells() const = 0;

    /// Starts the log with everything that the modem knows.
    virtual void begin(ModemLog& log) = 0;
    /// Logs what has changed after the world has moved by `kMoveSeconds`.
    virtual void move(ModemLog& log) = 0;
    /// Logs the periodic records of tick `number`.
    virtual void tick(ModemLog& log, unsigned number) = 0;
};

} // namespace kestrum
