#include "LogGenerator/ZPH_GSM/EquivalentPLMNList.h"

namespace kestrum {
namespace {

constexpr LogCode kCode = 0x7150;
constexpr std::size_t kMinimumLength = 17;

constexpr Field kCount = u8(16);
// Each network is six digits, a byte each, yet the next one begins three bytes on: on purpose.
constexpr Elements kNetworks{17, 3, 6};

/// The number of three digits, the first at `first`, each two bytes from the next.
std::string number(Record network, std::size_t first)
{
    std::uint32_t value = 0;
    for (std::size_t i = 0; i < 3; ++i)
        value = 10 * value + std::to_integer<std::uint32_t>(network.bytes()[first + 2 * i]);
    return formatted("%d", static_cast<std::uint16_t>(value));
}

/// The digits of both numbers take turns.
void showNetwork(Record network, Dictionary& row)
{
    row.setText("Mobile Country Code", number(network, 0));
    row.setText("Mobile Network Code", number(network, 1));
}

} // namespace

std::string_view EquivalentPLMNList::getSectionName() const
{
    return "Equivalent PLMN List";
}

std::vector<LogCode> EquivalentPLMNList::getLogCodeArray() const
{
    return {kCode};
}

void EquivalentPLMNList::updateWithData(Record data, LogCode logCode)
{
    if (accepts(data, logCode, kCode, kMinimumLength))
        replaceArray(sectionRef, listed(data, kNetworks, data.read(kCount).value_or(0), showNetwork));
}

} // namespace kestrum
