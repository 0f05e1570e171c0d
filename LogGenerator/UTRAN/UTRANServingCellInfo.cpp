#include "LogGenerator/UTRAN/UTRANServingCellInfo.h"

#include "LogGenerator/CellMonitor.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

constexpr std::size_t kMinimumLength = 26;

std::string_view access(std::uint32_t raw)
{
    return raw != 0 ? "Emergency Calls Only" : "All Calls";
}

// clang-format off
constexpr Row kServingCell[] = {
    {u8(14),        "Cell Access Restrictions", decimal},
    // Printed signed, on purpose: from 2^31 it shows negative.
    {u32(21),       "Cell ID",                  decimal},
    {u16(19),       "Downlink UARFCN",          decimal},
    {u16(17),       "Uplink UARFCN",            decimal},
    {u8(15),        "URA ID",                   decimal},
    {u8(25).bit(0), "Allowed Access",           access},
};
static_assert(reach(kServingCell) == kMinimumLength);

constexpr CellRow kMonitoredCell[] = {
    {kVoxCell_LAC,            "Local Area Code",      "Serving Cell Info: Failed to retrieve LAC\n"},
    {kVoxCell_CellId,         "Cell ID",              "Serving Cell Info: Failed to retrieve Cell ID\n"},
    {kVoxCell_BandInfo,       "Freq Band Indicator",  "Serving Cell Info: Failed to retrieve Freq Band Indicator\n"},
    {kVoxCell_ScramblingCode, "Cell Scrambling Code", "Serving Cell Info: Failed to retrieve Cell Scrambling Code\n"},
    // The one number is shown as both, on purpose; that it is missing is said once.
    {kVoxCell_UARFCN,         "Uplink UARFCN",        "Serving Cell Info: Failed to retrieve UARFCN\n"},
    {kVoxCell_UARFCN,         "Downlink UARFCN",      ""},
};
// clang-format on

} // namespace

std::string_view UTRANServingCellInfo::getSectionName() const
{
    return "Serving Cell Info";
}

std::vector<LogCode> UTRANServingCellInfo::getLogCodeArray() const
{
    return {0xD0E2, 0xFF0001};
}

void UTRANServingCellInfo::updateWithData(Record data, LogCode logCode)
{
    logEntry();
    if (logCode == 0xD0E2) {
        if (holds(data, kMinimumLength))
            publish(data, kServingCell);
    } else if (logCode == 0xFF0001) {
        const auto cells = CellInfoArray(data, roles).cells();
        if (!cells)
            return;
        // Every serving cell is shown in turn, so that the last one stays, on purpose.
        for (const Value& cell : *cells)
            if (isCell(cell, kVoxCellTechnology_UTRAN2, kVoxCellType_Serving))
                showCell(cell, kMonitoredCell, sectionRef.dictionary(), roles.log);
    }
}

} // namespace kestrum
