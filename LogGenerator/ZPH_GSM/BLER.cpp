#include "LogGenerator/ZPH_GSM/BLER.h"

namespace kestrum {
namespace {

constexpr Row kWindow[] = {{u16(14), "Window Size", decimalSigned32}};
constexpr Field kCount = u8(13);
constexpr Elements kChannels{16, 9};
// clang-format off
constexpr Row kChannel[] = {
    {u8(0),  "Transport Channel ID",  decimalSigned32},
    {u32(1), "CRC Received",          decimalSigned32},
    {u32(5), "CRC Received in Error", decimalSigned32},
};
// clang-format on
static_assert(reach(kChannel) == kChannels.length);

constexpr Layout kLayouts[] = {
    {.code = 0x4116, .minimumLength = 16, .rows = kWindow},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "BLER",
    .layouts = kLayouts,
};

} // namespace

BLER::BLER(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void BLER::decode(Record data, const Layout& layout)
{
    publish(data, layout.rows);
    publish("Transport Channels", listed(data, kChannels, data.read(kCount).value_or(0), kChannel));
}

} // namespace kestrum
