#pragma once

#include "tools/Output.h"

#include <memory>
#include <string>
#include <vector>

namespace kestrum {
class Bundle;
}

namespace kestrum::tools {

/// The options of the command line.
struct DecodeOptions {
    std::vector<std::string> files; ///< "-": standard input
    std::string technology;         ///< an identifier; empty: found in the messages
    OutputFormat format = OutputFormat::Tree;
    enum class Shown { Display, Events, Cells };
    Shown shown = Shown::Display;
    bool log = false, numbers = false, stats = false, follow = false;
    std::string extract;  ///< a directory; empty: nothing is extracted
    bool force = false;   ///< extracted files replace existing ones
    std::size_t jobs = 1; ///< processes that write jsonl and csv at a time
};

/// Decodes the files, as parts of one log, to standard output. Everything else goes to standard error. Returns the
/// exit status: 0, or 1 for bad input, whose good parts are shown nevertheless.
/// `output` takes the place of what the options choose.
int decodeFiles(const DecodeOptions& options, Bundle& bundle, std::unique_ptr<Output> output = nullptr);

} // namespace kestrum::tools
