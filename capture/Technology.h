#pragma once

#include "support/Bytes.h"

#include <optional>
#include <string_view>

namespace kestrum {

/// The technology (kVoxLogChannelTechnology_...) that alone has such messages; nothing for what several may send.
std::optional<std::string_view> technologyOf(Bytes message);

} // namespace kestrum
