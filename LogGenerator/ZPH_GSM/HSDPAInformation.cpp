#include "LogGenerator/ZPH_GSM/HSDPAInformation.h"

namespace kestrum {
namespace {

std::string_view carrier(std::uint32_t raw)
{
    static constexpr std::string_view kNames[] = {"Single Carrier", "MIMO", "Dual Carrier", "Reserved"};
    return nameIn(kNames, raw);
}

// clang-format off
constexpr Row kChannel[] = {
    {u8(13),              "Version",      decimalUnsigned},
    {u16(14).bits(0, 9),  "Sub Frames",   decimalUnsigned},
    {u8(15).bits(2, 3),   "Carrier Info", named<carrier>},
};
constexpr Row kProcess[] = {
    {u8(0),               "Process ID",   decimalUnsigned},
    {u32(1),              "No Rx Bits",   decimalUnsigned},
    {u16(5),              "New Tx",       decimalUnsigned},
    {u16(7),              "Block Errors", decimalUnsigned},
};
// clang-format on

constexpr Field kPrimaryCount = u8(16), kSecondaryCount = u8(17);
constexpr Elements kPrimary{18, 9};
// Kept: each primary process moves the secondary ones by 162 bytes although it has only 9.
constexpr std::size_t kRoomForPrimary = 162;

static_assert(reach(kProcess) == kPrimary.length);

constexpr Layout kLayouts[] = {
    {.code = 0x4221, .minimumLength = 18, .rows = kChannel},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "HSDPA Info",
    .layouts = kLayouts,
    .foreignCode = ForeignCode::Ignored,
};

} // namespace

HSDPAInformation::HSDPAInformation(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void HSDPAInformation::decode(Record data, const Layout& layout)
{
    publish(data, layout.rows);
    const std::size_t primary = data.read(kPrimaryCount).value_or(0);
    const std::size_t secondary = data.read(kSecondaryCount).value_or(0);
    const Elements behind{kPrimary.first + kRoomForPrimary * primary, kPrimary.stride};
    if (primary != 0)
        publish("Primary HARQ Process", listed(data, kPrimary, primary, kProcess));
    if (secondary != 0)
        publish("Secondary HARQ Process", listed(data, behind, secondary, kProcess));
}

} // namespace kestrum
