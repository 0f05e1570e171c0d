#include "LogGenerator/ZPH_GSM/GSMSet.h"

#include "LogGenerator/ZPH_GSM/ReselectionRanking.h"

namespace kestrum {
namespace {

constexpr Field kCount = u8(14);
// Kept: the list begins at the same offset as the UMTS cells, not behind them.
constexpr Elements kCells{ranking::kFirstCell, 7};

// clang-format off
constexpr Row kCell[] = {
    {u16(0), "ARFCN",         decimalSigned32},
    {u16(2), "BSIC",          decimalSigned32},
    {u8(4),  "RSSI",          inWholeDbm<signed8>},
    {u16(5), "Ranking Value", decimalSigned16},
};
// clang-format on

constexpr Layout kLayouts[] = {
    {.code = ranking::kCode, .minimumLength = ranking::kMinimumLength, .rows = kCell, .list = {{kCount, kCells}}},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "GSM Set",
    .layouts = kLayouts,
    .entryLine = "GSMSet",
};

} // namespace

GSMSet::GSMSet(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

} // namespace kestrum
