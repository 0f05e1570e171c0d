#include "LogGenerator/UTRAN/UTRANServingCellInfo.h"

#include "LogGenerator/CellMonitor.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

std::string_view access(std::uint32_t raw)
{
    return raw != 0 ? "Emergency Calls Only" : "All Calls";
}

// clang-format off
constexpr Row kServingCell[] = {
    {u8(14),        "Cell Access Restrictions", decimalSigned32},
    // Kept: printed as a signed number; field logs show values from 2^31 as negative.
    {u32(21),       "Cell ID",                  decimalSigned32},
    {u16(19),       "Downlink UARFCN",          decimalSigned32},
    {u16(17),       "Uplink UARFCN",            decimalSigned32},
    {u8(15),        "URA ID",                   decimalSigned32},
    {u8(25).bit(0), "Allowed Access",           named<access>},
};

constexpr CellRow kMonitoredCell[] = {
    {kVoxCell_LAC,            "Local Area Code",      "Serving Cell Info: Failed to retrieve LAC\n"},
    {kVoxCell_CellId,         "Cell ID",              "Serving Cell Info: Failed to retrieve Cell ID\n"},
    {kVoxCell_BandInfo,       "Freq Band Indicator",  "Serving Cell Info: Failed to retrieve Freq Band Indicator\n"},
    {kVoxCell_ScramblingCode, "Cell Scrambling Code", "Serving Cell Info: Failed to retrieve Cell Scrambling Code\n"},
    // Kept: one number is shown as both frequencies. When it is missing, one line is logged.
    {kVoxCell_UARFCN,         "Uplink UARFCN",        "Serving Cell Info: Failed to retrieve UARFCN\n"},
    {kVoxCell_UARFCN,         "Downlink UARFCN",      ""},
};
// clang-format on

constexpr Layout kLayouts[] = {
    {.code = 0xD0E2, .minimumLength = 26, .rows = kServingCell},
    {.code = kCellMonitorRecord},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Serving Cell Info",
    .layouts = kLayouts,
    .foreignCode = ForeignCode::Ignored,
};

} // namespace

UTRANServingCellInfo::UTRANServingCellInfo(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void UTRANServingCellInfo::decode(Record data, const Layout& layout)
{
    if (layout.code != kCellMonitorRecord)
        return publish(data, layout.rows);
    const auto cells = CellInfoArray(data, roles).cells();
    if (!cells)
        return;
    // Kept: the last serving cell of the record wins.
    for (const Value& cell : *cells)
        if (isCell(cell, kVoxCellTechnology_UTRAN2, kVoxCellType_Serving))
            showCell(cell, kMonitoredCell, sectionRef.dictionary(), roles.log);
}

} // namespace kestrum
