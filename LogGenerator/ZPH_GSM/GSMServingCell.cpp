#include "LogGenerator/ZPH_GSM/GSMServingCell.h"

#include "LogGenerator/CellMonitor.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

// clang-format off
constexpr Row kMeasurements[] = {
    {u8(15),               "RSSI",               inWholeDbm<signed32>}, // kept: not negated
    {u32(16).bits(0, 15),  "C1 Value",           decimalSigned32},
    {u32(20).bits(0, 15),  "C2 Value",           decimalSigned32},
};
constexpr Row kDedicatedAllocation[] = {
    {u16(13).bits(0, 7),   "MA Dedicated ARFCN", decimalSigned32},
};
constexpr Row kIdentity[] = {
    {u16(17),              "Cell ID",            decimalSigned32},
    {u16(13),              "ARFCN",              decimalSigned32},
    {u16(15),              "BSIC",               decimalSigned32},
};

constexpr CellRow kCell[] = {
    {kVoxCell_CellId, "Cell ID", "GSMServingCell: Failed to retrieve Cell ID\n"},
    {kVoxCell_ARFCN,  "ARFCN",   "GSMServingCell: Failed to retrieve ARFCN\n"},
};
// clang-format on

constexpr Layout kLayouts[] = {
    {.code = 0x5134, .minimumLength = 26, .rows = kIdentity},
    {.code = 0x5137, .minimumLength = 29, .rows = kMeasurements},
    {.code = 0x5076, .minimumLength = 17, .rows = kDedicatedAllocation},
    {.code = kCellMonitorRecord},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "GSM Serving Cell",
    .layouts = kLayouts,
    .entryLine = "GSMServingCell",
};

} // namespace

GSMServingCell::GSMServingCell(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void GSMServingCell::decode(Record data, const Layout& layout)
{
    if (layout.code == kCellMonitorRecord)
        showServingCell(data, {kVoxCellTechnology_GSM}, kCell, sectionRef.dictionary(), roles);
    else
        publish(data, layout.rows);
}

} // namespace kestrum
