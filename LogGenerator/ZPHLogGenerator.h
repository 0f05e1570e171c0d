#pragma once

#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/RawRecords.h"

#include <optional>

namespace kestrum {

/// The base of the technologies whose modem sends binary records: keeps the raw messages of the refresh interval,
/// and makes a DLF stream of the history.
class ZPHLogGenerator : public LogGenerator {
public:
    /// A version report, then each history entry's raw records less the first byte of the interval. Nothing when an
    /// entry holds something else, which is logged.
    std::optional<Data> generateDlfFromState(const State& state) const;

    /// The history entries, then {"Description": "DLF binary (%d bytes)", "DLF": data} where the DLF could be made.
    ArrayRef getSaveContentsFromState(const State& state) const override;

protected:
    using LogGenerator::LogGenerator;

    void appendToBinData(Bytes bytes) { binData.append(bytes); }
    /// Hands the interval's raw messages over to the state, and begins a new interval. Logs how many were dropped.
    void moveBinDataToState(State& state);

private:
    RawRecords binData;
};

} // namespace kestrum
