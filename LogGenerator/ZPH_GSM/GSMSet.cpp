#include "LogGenerator/ZPH_GSM/GSMSet.h"

#include "LogGenerator/ZPH_GSM/ReselectionRanking.h"

namespace kestrum {
namespace {

constexpr Field kCount = u8(14);
// From where the UMTS cells begin too, not from behind them: on purpose.
constexpr Elements kCells{ranking::kFirstCell, 7};

std::string dbm(std::uint32_t raw)
{
    return formatted("%d dBm", static_cast<std::int8_t>(raw));
}

// clang-format off
constexpr Row kCell[] = {
    {u16(0), "ARFCN",         decimal},
    {u16(2), "BSIC",          decimal},
    {u8(4),  "RSSI",          dbm},
    {u16(5), "Ranking Value", decimalSigned16},
};
// clang-format on
static_assert(reach(kCell) == kCells.length);

} // namespace

std::string_view GSMSet::getSectionName() const
{
    return "GSM Set";
}

std::vector<LogCode> GSMSet::getLogCodeArray() const
{
    return {ranking::kCode};
}

void GSMSet::updateWithData(Record data, LogCode logCode)
{
    if (accepts(data, logCode, ranking::kCode, ranking::kMinimumLength))
        replaceArray(sectionRef, listed(data, kCells, data.read(kCount).value_or(0), kCell));
}

} // namespace kestrum
