#pragma once

#include "support/Bytes.h"

#include <optional>
#include <string_view>

namespace kestrum {

/// The only technology (kVoxLogChannelTechnology_...) that sends such messages; nothing when several may.
std::optional<std::string_view> technologyOf(Bytes message);

} // namespace kestrum
