#include "LogGenerator/ZPH_GSM/EquivalentPLMNList.h"

namespace kestrum {
namespace {

constexpr Field kCount = u8(16);
// Kept: a network has six digits of one byte each, but the next network begins three bytes further on.
constexpr Elements kNetworks{17, 3, 6};

/// The number of three digits: the first at `first`, the others 2 and 4 bytes behind it.
Reading number(Record network, std::size_t first)
{
    std::uint32_t value = 0;
    for (std::size_t i = 0; i < 3; ++i)
        value = 10 * value + std::to_integer<std::uint32_t>(network.bytes()[first + 2 * i]);
    return {decimalUnsigned, value};
}

/// The digits of both numbers alternate.
void showNetwork(Record network, Dictionary& row)
{
    row.set("Mobile Country Code", number(network, 0));
    row.set("Mobile Network Code", number(network, 1));
}

constexpr Layout kLayouts[] = {
    {.code = 0x7150, .minimumLength = 17},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Equivalent PLMN List",
    .layouts = kLayouts,
};

} // namespace

EquivalentPLMNList::EquivalentPLMNList(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void EquivalentPLMNList::decode(Record data, const Layout&)
{
    replaceArray(sectionRef, listed(data, kNetworks, data.read(kCount).value_or(0), showNetwork));
}

} // namespace kestrum
