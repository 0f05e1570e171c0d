#pragma once

#include "platform/PropertyLists.h"
#include "voxd/scenarios/RecordWriter.h"

#include <chrono>
#include <string_view>
#include <utility>
#include <vector>

namespace kestrum {

/// Whether what is logged every `period` ticks is due in a tick; not all periods begin together.
constexpr bool isDue(unsigned tick, unsigned period)
{
    return tick % period == period / 2;
}

/// The records that a modem and its telephony service write within a tick, in order.
class ModemLog {
public:
    /// The lists outlive the log.
    explicit ModemLog(PropertyLists& lists) : _lists(lists) {}

    void add(RecordWriter record) { _records.push_back(std::move(record)); }
    void add(LogCode code, const Value& propertyList);

    std::vector<RecordWriter> take() { return std::exchange(_records, {}); }

private:
    PropertyLists& _lists;
    std::vector<RecordWriter> _records;
};

/// A modem on the drive, of one technology: it receives the world's cells and logs what it measures and does.
class Modem {
public:
    virtual ~Modem() = default;

    /// A tick is as long as the shortest period of its records.
    static constexpr std::chrono::milliseconds kTick{10};
    /// So many ticks are a second.
    static constexpr unsigned kSecond = 100;
    /// The world moves that many ticks at once.
    static constexpr unsigned kMove = 10;
    static constexpr double kMoveSeconds = 0.1;

    /// kVoxLogChannelTechnology_...
    virtual std::string_view technology() const = 0;

    /// Its log begins: whatever it knows goes into it.
    virtual void begin(ModemLog& log) = 0;
    /// The world has moved by `kMoveSeconds`; what changes with it is logged.
    virtual void move(ModemLog& log) = 0;
    /// What is logged again and again, in the tick of that number.
    virtual void tick(ModemLog& log, unsigned number) = 0;
};

} // namespace kestrum
