#include "LogGenerator/ZPH_GSM/MobileAllocation.h"

namespace kestrum {
namespace {

constexpr Row kHopping[] = {{u8(13), "HSN", decimalSigned32}};
constexpr Field kCount = u8(14);
constexpr Elements kArfcns{15, 2};

constexpr Layout kLayouts[] = {
    {.code = 0x51F8, .minimumLength = 15, .rows = kHopping},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Mobile Allocation",
    .layouts = kLayouts,
    .entryLine = "MobileAllocation",
};

} // namespace

MobileAllocation::MobileAllocation(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void MobileAllocation::decode(Record data, const Layout& layout)
{
    publish(data, layout.rows);
    publish("ARFCNs", listed(data, kArfcns, data.read(kCount).value_or(0), u16(0), decimalSigned32));
}

} // namespace kestrum
