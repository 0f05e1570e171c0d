#pragma once

#include "tools/Output.h"

#include <string>
#include <vector>

namespace kestrum {
class Bundle;
}

namespace kestrum::tools {

/// What the command line asks for.
struct DecodeOptions {
    std::vector<std::string> files; ///< "-": standard input
    std::string technology;         ///< an identifier; empty: found in the messages
    OutputFormat format = OutputFormat::Tree;
    bool log = false, numbers = false, stats = false, follow = false;
    std::string extract; ///< a directory; empty: nothing is extracted
    bool force = false;  ///< extracted files replace existing ones
};

/// Decodes the files, as parts of one log, onto standard output; all else goes to standard error. Gives the exit
/// status: 0, or 1 when there was bad input, whose good parts are shown all the same.
int decodeFiles(const DecodeOptions& options, Bundle& bundle);

} // namespace kestrum::tools
