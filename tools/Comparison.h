#pragma once

#include "tools/Program.h"

namespace kestrum::tools {

/// Shows what differs between the displays at the ends of two captures or snapshots, `options.files`. Returns the exit
/// status: 0 nothing differs, 1 something does, 2 a file could not be read completely.
int compareFiles(const DecodeOptions& options, Bundle& bundle);

} // namespace kestrum::tools
