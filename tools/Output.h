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

enum class OutputFormat { Tree, Json, Jsonl, Csv };

/// Puts what is decoded on standard output.
class Output {
public:
    virtual ~Output() = default;

    /// One more message is decoded.
    virtual void message(const Decoding&, const Decoding::Decoded&) {}
    virtual void logLine(Priority priority, std::string_view text) = 0;
    virtual void snapshot(const SnapshotListing& listing) = 0;
    /// The display as it stands: at the end, and, of a file that is followed, whenever its end was met.
    virtual void display(const Decoding&) {}

    /// What is written beside the values.
    struct Contents {
        bool log = false;     ///< lines of the system log
        bool numbers = false; ///< jsonl: {"text", "number", "unit"} for a value that measures something
    };
    static std::unique_ptr<Output> make(OutputFormat format, Contents contents, OutputFile& data, OutputFile& remarks);
};

} // namespace kestrum::tools
