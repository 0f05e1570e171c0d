#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace kestrum::tools {

/// The name, on a map, of a value that identifies the serving cell or is one of its levels: "Measured RSRP",
/// "GSM Cell ID". Nothing for other values. `path` is a JSON Pointer into the technology's display.
std::optional<std::string> servingCellName(std::string_view technology, std::string_view path);

} // namespace kestrum::tools
