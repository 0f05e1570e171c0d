#include "LogGenerator/LTE/LTEServingCellInfo.h"

#include "LogGenerator/CellMonitor.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

std::string_view bandwidth(std::uint32_t resourceBlocks)
{
    switch (resourceBlocks) {
    case 6:
        return "1.4 MHz";
    case 15:
        return "3 MHz";
    case 25:
        return "5 MHz";
    case 50:
        return "10 MHz";
    case 75:
        return "15 MHz";
    case 100:
        return "20 MHz";
    default:
        return "Unknown";
    }
}

// clang-format off
constexpr std::size_t kAntennasLength = 22;
constexpr Row kAntennas[] = {{u8(20), "Num Tx Antennas", decimal}};
static_assert(reach(kAntennas) <= kAntennasLength);

constexpr std::size_t kServingCellLength = 38;
constexpr Row kServingCell[] = {
    {u16(14), "Physical Cell ID",    decimal},
    {u16(16), "Download Frequency",  decimal},
    {u16(18), "Upload Frequency",    decimal},
    {u8(20),  "Download Bandwidth",  bandwidth},
    {u8(21),  "Upload Bandwidth",    bandwidth},
    // Words are printed signed, on purpose: from 2^31 they show negative.
    {u32(22), "Cell Identity",       decimal},
    {u16(26), "Tracking Area Code",  decimal},
    {u32(28), "Freq Band Indicator", decimal},
};
static_assert(reach(kServingCell) <= kServingCellLength);

constexpr CellRow kMonitoredCell[] = {
    {kVoxCell_TAC,            "Tracking Area Code",  "Serving Cell Info: Failed to retrieve TAC\n"},
    {kVoxCell_CellId,         "Cell Identity",       "Serving Cell Info: Failed to retrieve Cell ID\n"},
    {kVoxCell_PhysicalCellId, "Physical Cell ID",    "Serving Cell Info: Failed to retrieve Physical Cell ID\n"},
    {kVoxCell_BandInfo,       "Freq Band Indicator", "Serving Cell Info: Failed to retrieve Freq Band Indicator\n"},
    {kVoxCell_UARFCN,         "UARFCN",              "Serving Cell Info: Failed to retrieve UARFCN\n"},
};
// clang-format on

} // namespace

std::string_view LTEServingCellInfo::getSectionName() const
{
    return "Serving Cell Info";
}

std::vector<LogCode> LTEServingCellInfo::getLogCodeArray() const
{
    return {0xB0C2, 0xB0C1, 0xFF0001};
}

void LTEServingCellInfo::updateWithData(Record data, LogCode logCode)
{
    logEntry();
    switch (logCode) {
    case 0xB0C1:
        if (!holds(data, kAntennasLength))
            return;
        publish(data, kAntennas);
        // Shown and reported all the same, on purpose.
        return reportUnknown(logCode);
    case 0xB0C2:
        if (!holds(data, kServingCellLength))
            return;
        publish(data, kServingCell);
        // The frequencies above stand for the cell monitor's.
        if (auto* node = sectionRef.dictionary())
            node->remove("UARFCN");
        return;
    case 0xFF0001:
        return showServingCell(data, {kVoxCellTechnology_LTE}, kMonitoredCell, sectionRef.dictionary(), roles);
    default:
        reportUnknown(logCode);
    }
}

} // namespace kestrum
