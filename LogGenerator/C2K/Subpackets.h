#pragma once

#include "support/Record.h"

#include <cstdint>
#include <optional>

namespace kestrum {

class SystemLog;

/// Records that consist of subpackets (0x119C, 0x119D): their number is at offset 14, the first begins at 17. In a
/// subpacket the identifier is at 0 and the size, header included, at 2 (16 bits).
inline constexpr std::size_t kSubpacketsStart = 17;

/// The first subpacket with the identifier, up to the end of the record: fields may lie beyond the subpacket's size.
/// Nothing when there is none. A size out of bounds is logged.
std::optional<Record> findSubpacket(Record record, std::uint32_t identifier, SystemLog& log);

} // namespace kestrum
