#include "LogGenerator/C2K/BandClass.h"
#include "LogGenerator/C2K/Decoders.h"
#include "platform/SystemLog.h"

namespace kestrum {
namespace {

constexpr std::size_t kLength = 50;
constexpr std::uint32_t kFirstStateWithLink = 4; // Access, Connected

std::string nameOrReserved(std::uint32_t raw, std::span<const std::string_view> names)
{
    return raw < names.size() ? std::string(names[raw]) : formatted("[Reserved %d]", static_cast<std::int32_t>(raw));
}

std::string deviceState(std::uint32_t raw)
{
    constexpr std::string_view kNames[] = {"Inactive [0]", "Acquisition [1]", "Sync [2]",
                                           "Idle [3]",     "Access [4]",      "Connected [5]"};
    return nameOrReserved(raw, kNames);
}

std::string sessionState(std::uint32_t raw)
{
    constexpr std::string_view kNames[] = {"Closed [0]", "AMP setup [1]", "AT-initiated neg [2]", "Initiated neg [3]",
                                           "Open [4]"};
    return nameOrReserved(raw, kNames);
}

constexpr Quantity kSignedDbm{[](Quantity::Raw raw) { return formatted("%+d dBm", signed8(fieldOf(raw))); },
                              numberOf<signed8>, "dBm"};

std::string_view withoutLink(std::uint32_t)
{
    return "N/A";
}

std::string_view invalidOffset(std::uint32_t)
{
    return "Invalid Value";
}

constexpr Quantity kPnOffset{[](Quantity::Raw raw) { return formatted("%d × 64chips", signed32(fieldOf(raw))); },
                             numberOf<signed32>, "× 64chips"};

std::string uati(std::uint32_t raw)
{
    return formatted("0x%06x", raw);
}

// clang-format off
constexpr Field kDeviceState = u8(36);

constexpr Row kTuning[] = {
    {u16(13).bits(0, 10),  "kChannel",            decimalSigned32},
    {kDeviceState,         "k1xEVDODeviceState",  named<deviceState>},
    {u16(13).bits(11, 15), "kBandClass",          named<bandClassName>},
    {u8(15),               "kRxAGC0",             kSignedDbm},
};
// The second receive chain and the transmitter have valid values only while there is a link.
constexpr Row kLink[] = {
    {u8(16),               "kRxAGC1",             kSignedDbm},
    {u8(17),               "kTxAGC",              kSignedDbm},
};
constexpr Row kNoLink[] = {
    {u8(16),               "kRxAGC1",             named<withoutLink>},
    {u8(17),               "kTxAGC",              named<withoutLink>},
};
constexpr Row kSession[] = {
    {u16(18),              "kServingPNOffset",    exceptFor<isValue<0xFFFF>, invalidOffset, kPnOffset>},
    {u8(37),               "kSessionState",       named<sessionState>},
    {u32(38).bits(0, 23),  "kUATI24",             named<uati>},
    {u8(41),               "kColorCode",          decimalSigned32},
};
// clang-format on
static_assert(reach(kTuning) <= kLength && reach(kLink) <= kLength && reach(kSession) <= kLength);

} // namespace

void decodeEvdoStatus(Record record, C2KContext& context)
{
    if (record.size() != kLength) {
        context.rejectLength(formatted("Log code 0x1183 is %u bytes long but should be %lu bytes.",
                                       static_cast<unsigned>(record.size()), kLength));
        return;
    }
    context.publish(record, kTuning);
    const bool hasLink = record.read(kDeviceState).value_or(0) >= kFirstStateWithLink;
    context.publish(record, hasLink ? std::span<const Row>(kLink) : std::span<const Row>(kNoLink));
    context.publish(record, kSession);
}

} // namespace kestrum
