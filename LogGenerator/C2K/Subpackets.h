#pragma once

#include "support/Record.h"

#include <cstdint>
#include <optional>

namespace kestrum {

class SystemLog;

/// Records made of subpackets (0x119C, 0x119D): their count at 14, the first at 17. Each begins with its identifier
/// (byte 0) and holds its size, header included, as 16 bits at 2.
inline constexpr std::size_t kSubpacketsStart = 17;

/// The first subpacket with the identifier: the record from there to its end, since a field may lie beyond the size
/// that the subpacket claims. Nothing when there is none; a size out of bounds is logged.
std::optional<Record> findSubpacket(Record record, std::uint32_t identifier, SystemLog& log);

} // namespace kestrum
