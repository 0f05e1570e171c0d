#include "LogGenerator/ZPH_GSM/GSMServingCell.h"

#include "LogGenerator/CellMonitor.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

constexpr LogCode kCellMonitor = 0xFF0001;

std::string dbm(std::uint32_t raw)
{
    return formatted("%d dBm", static_cast<std::int32_t>(raw)); // not negated, on purpose
}

// clang-format off
constexpr Row kMeasurements[] = {
    {u8(15),               "RSSI",               dbm},
    {u32(16).bits(0, 15),  "C1 Value",           decimal},
    {u32(20).bits(0, 15),  "C2 Value",           decimal},
};
constexpr Row kDedicatedAllocation[] = {
    {u16(13).bits(0, 7),   "MA Dedicated ARFCN", decimal},
};
constexpr Row kIdentity[] = {
    {u16(17),              "Cell ID",            decimal},
    {u16(13),              "ARFCN",              decimal},
    {u16(15),              "BSIC",               decimal},
};

constexpr Layout kLayouts[] = {
    {0x5134, 26, kIdentity},
    {0x5137, 29, kMeasurements},
    {0x5076, 17, kDedicatedAllocation},
};

constexpr CellRow kCell[] = {
    {kVoxCell_CellId, "Cell ID", "GSMServingCell: Failed to retrieve Cell ID\n"},
    {kVoxCell_ARFCN,  "ARFCN",   "GSMServingCell: Failed to retrieve ARFCN\n"},
};
// clang-format on
static_assert(rowsFit(kLayouts));

} // namespace

std::string_view GSMServingCell::getSectionName() const
{
    return "GSM Serving Cell";
}

std::vector<LogCode> GSMServingCell::getLogCodeArray() const
{
    return codesOf(kLayouts, {kCellMonitor});
}

void GSMServingCell::updateWithData(Record data, LogCode logCode)
{
    logEntry();
    if (logCode == kCellMonitor)
        showServingCell(data, {kVoxCellTechnology_GSM}, kCell, sectionRef.dictionary(), roles);
    else if (!publish(data, logCode, kLayouts))
        reportUnknown(logCode);
}

} // namespace kestrum
