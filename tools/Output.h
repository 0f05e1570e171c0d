#pragma once

#include "support/Value.h"
#include "tools/Decoding.h"
#include "tools/OutputFile.h"
#include "tools/Snapshot.h"

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace kestrum::tools {

enum class OutputFormat { Tree, Json, Jsonl, Csv, Geojson };

/// Writes the decoded messages and the display to standard output.
class Output {
public:
    virtual ~Output() = default;

    /// Called after each decoded message.
    virtual void message(const Decoding&, const Decoding::Decoded&) {}
    /// Takes the display as seen: writes nothing about the changes since the last message.
    virtual void resume(const Decoding&) {}
    virtual void logLine(Priority priority, std::string_view text) = 0;
    virtual void snapshot(const SnapshotListing& listing) = 0;
    /// Called with the current display at the end, and whenever the end of a followed file is reached.
    virtual void display(const Decoding&) {}
    /// Called once, after all else, also when the input was bad.
    virtual void finish() {}

    /// What is written besides the values.
    struct Contents {
        bool log = false;     ///< lines of the system log
        bool numbers = false; ///< jsonl: {"text", "number", "unit"} for a value with a number
    };
    static std::unique_ptr<Output> make(OutputFormat format, Contents contents, OutputFile& data, OutputFile& remarks);
};

} // namespace kestrum::tools
