#include "LogGenerator/C2K/Decoders.h"
#include "platform/SystemLog.h"

namespace kestrum {
namespace {

constexpr std::size_t kMinimumLength = 171;
constexpr std::uint32_t kFirstVersion = 2;
constexpr std::uint32_t kKnownSystemType = 2;

/// The enhanced roaming indicator (3GPP2 C.R1001), signed.
std::string roamingIndicator(std::uint32_t raw)
{
    constexpr std::string_view kNames[] = {"OFF [0]",
                                           "ON [1]",
                                           "Flashing [2]",
                                           "Out of Neighborhood [3]",
                                           "Out of Building [4]",
                                           "Preferred system [5]",
                                           "Available system [6]",
                                           "Alliance partner [7]",
                                           "Premium partner [8]",
                                           "Full service functionality [9]",
                                           "Partial service functionality [10]",
                                           "Banner ON [11]",
                                           "Banner OFF [12]"};
    if (raw < std::size(kNames))
        return std::string(kNames[raw]);
    return formatted("ERI - %d", static_cast<std::int32_t>(raw));
}

// clang-format off
constexpr Field kVersion    = u8(13);
constexpr Field kSystemType = u32(46);

constexpr Row kRoaming[] = {
    {u32(42),  "k1xRoamingHome",    named<roamingIndicator>},
};
constexpr Row kIdentifiers[] = {
    {u16(50),  "kSystemId",         decimalSigned32},
    {u16(52),  "kNetworkId",        decimalSigned32},
};
constexpr Row kBase[] = {
    {u8(131),  "kPacketZoneId",     decimalSigned32},
    {u16(184), "kBaseId",           decimalSigned32}, // beyond the minimum length: a shorter record does not change it
    {u8(133),  "kProtocolRevision", decimalSigned32},
};
// clang-format on
static_assert(reach(kRoaming) <= kMinimumLength && reach(kIdentifiers) <= kMinimumLength);

} // namespace

void decodeSystemIdentity(Record record, C2KContext& context)
{
    if (record.size() < kMinimumLength) {
        context.rejectLength(formatted("Log code 0x134f is %d bytes long but must be at least %lu bytes.",
                                       static_cast<int>(record.size()), kMinimumLength));
        return;
    }
    const auto version = record.read(kVersion).value_or(0);
    if (version < kFirstVersion) {
        context.log.write(Priority::Error,
                          "Log code 0x134f has version=%d; only version 2 or higher expected; dropping.",
                          static_cast<std::int32_t>(version));
        return;
    }
    context.publish(record, kRoaming);
    const auto systemType = record.read(kSystemType).value_or(0);
    if (systemType == kKnownSystemType) {
        context.publish(record, kIdentifiers);
    } else {
        const auto unknown = formatted("(unknown system type %d)", static_cast<std::int32_t>(systemType));
        for (const auto& row : kIdentifiers)
            context.publish(row.key, unknown);
    }
    context.publish(record, kBase);
}

} // namespace kestrum
