#pragma once

#include "tools/Output.h"

#include <memory>

namespace kestrum::tools {

/// Writes what happened, or the cells that served, in place of the display: as tree, JSON or CSV.
std::unique_ptr<Output> makeEventsOutput(OutputFormat format, OutputFile& data, OutputFile& remarks);
std::unique_ptr<Output> makeCellsOutput(OutputFormat format, OutputFile& data, OutputFile& remarks);

} // namespace kestrum::tools
