#include "LogGenerator/C2K/Subpackets.h"

#include "platform/SystemLog.h"
#include "support/Format.h"

namespace kestrum {
namespace {

constexpr Field kCount = u8(14);

// Offsets from the subpacket's first byte.
constexpr Field kIdentifier = u8(0);
constexpr Field kSize = u16(2);

} // namespace

std::optional<Record> findSubpacket(Record record, std::uint32_t identifier, SystemLog& log)
{
    const auto count = record.read(kCount).value_or(0);
    std::size_t start = kSubpacketsStart;
    for (std::uint32_t index = 0; index < count; ++index) {
        const auto subpacket = record.from(start);
        const auto size = subpacket ? subpacket->read(kSize) : std::nullopt;
        if (!size)
            return std::nullopt;
        // Kept: the bound lies 17 bytes beyond the record's end and is checked before the identifier; field logs
        // depend on both. Record keeps every read inside the record.
        if (start + *size >= kSubpacketsStart + record.size()) {
            log.write(Priority::Error, "Log code error in subpkt#%d: bad size (%d).", static_cast<std::int32_t>(index),
                      static_cast<std::int32_t>(*size));
            return std::nullopt;
        }
        if (subpacket->read(kIdentifier) == identifier)
            return subpacket;
        // A size of 0 does not advance; the loop ends when the index reaches the count.
        start += *size;
    }
    return std::nullopt;
}

} // namespace kestrum
