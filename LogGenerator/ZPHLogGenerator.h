#pragma once

#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/RawRecords.h"

#include <optional>

namespace kestrum {

/// Base class for technologies with binary records: keeps the raw messages of the refresh interval and makes a DLF
/// stream of the history.
class ZPHLogGenerator : public LogGenerator {
public:
    /// A version report, then the raw records of each history entry without the interval's first byte. Nothing, with a
    /// log line, when an entry's "DisplayState" is no data.
    std::optional<Data> generateDlfFromState(const State& state) const;

    /// The history entries, then {"Description": "DLF binary (%d bytes)", "DLF": data} if the DLF could be made.
    ArrayRef getSaveContentsFromState(const State& state) const override;

protected:
    using LogGenerator::LogGenerator;

    void appendToBinData(Bytes bytes) { binData.append(bytes); }
    /// Moves the interval's raw messages to the state and begins a new interval. Logs how many were dropped.
    void moveBinDataToState(State& state);

private:
    RawRecords binData;
};

} // namespace kestrum
