#include "LogGenerator/ZPH_GSM/UMTSSet.h"

#include "LogGenerator/CellMonitor.h"
#include "LogGenerator/ZPH_GSM/ReselectionRanking.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

constexpr Field kCount = u8(13);
constexpr Elements kRanked{ranking::kFirstCell, 10};

// Kept: levels, shown in dB.
constexpr int rscp(std::uint32_t raw)
{
    return signed8(raw) - 21;
}

constexpr double halfDb(std::uint32_t raw)
{
    return signed8(raw) * 0.5;
}
constexpr Quantity kHalfDb{[](Quantity::Raw raw) { return formatted("%f dB", halfDb(fieldOf(raw))); }, numberOf<halfDb>,
                           "dB"};

// clang-format off
constexpr Row kRankedCell[] = {
    {u16(2), "Scrambling Code",    decimalSigned32},
    {u8(4),  "RSCP",               inWholeDb<rscp>},
    {u8(7),  "Energy Per Chip",    kHalfDb},
    {u16(0), "Downlink Frequency", decimalSigned16},
    {u16(8), "Ranking Value",      decimalSigned16},
    {u16(5), "Rank Cell RSCP",     inWholeDb<signed16>},
};
// clang-format on

// clang-format off
constexpr CellRow kMonitoredCell[] = {
    {kVoxCell_UARFCN,         "UARFCN",          "UMTSSet: Failed to retrieve UARFCN\n"},
    {kVoxCell_ScramblingCode, "Scrambling Code", "UMTSSet: Failed to retrieve Scrambling Code\n"},
    {kVoxCell_RSCP,           "RSCP",            "UMTSSet: Failed to retrieve RSCP\n",            kWhereMeasured<inWholeDbm<signed16>>},
    {kVoxCell_EcNo,           "Energy Per Chip", "UMTSSet: Failed to retrieve Energy Per Chip\n", kWhereMeasured<inWholeDb<signed16>>},
};
// clang-format on

constexpr Layout kLayouts[] = {
    {.code = ranking::kCode,
     .minimumLength = ranking::kMinimumLength,
     .rows = kRankedCell,
     .list = {{kCount, kRanked}}},
    {.code = kCellMonitorRecord},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "UMTS Set",
    .layouts = kLayouts,
    .entryLine = "UMTSSet",
};

} // namespace

UMTSSet::UMTSSet(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void UMTSSet::decode(Record data, const Layout& layout)
{
    if (layout.code != kCellMonitorRecord)
        return Base::decode(data, layout);
    replaceArray(sectionRef,
                 [&](Array& list) { appendNeighbors(list, data, kVoxCellTechnology_UMTS, kMonitoredCell, roles); });
}

} // namespace kestrum
