#pragma once

#include "support/Value.h"

#include <string_view>

namespace kestrum::propertylist {

inline constexpr std::string_view kBinaryMagic = "bplist00";

/// Reads a binary property list; the bytes begin with `kBinaryMagic`. Throws `Refusal` when they are malformed.
Value readBinary(Bytes bytes);

} // namespace kestrum::propertylist
