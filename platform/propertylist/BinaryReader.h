#pragma once

#include "support/Value.h"

#include <string_view>

namespace kestrum::propertylist {

inline constexpr std::string_view kBinaryMagic = "bplist00";

/// The value of a binary property list, which begins with `kBinaryMagic`; throws `Refusal` when the rest is none.
Value readBinary(Bytes bytes);

} // namespace kestrum::propertylist
