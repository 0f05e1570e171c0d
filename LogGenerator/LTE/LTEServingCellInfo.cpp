#include "LogGenerator/LTE/LTEServingCellInfo.h"

#include "LogGenerator/CellMonitor.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

constexpr LogCode kServingCellRecord = 0xB0C2, kAntennasRecord = 0xB0C1;

/// The channel bandwidth (3GPP TS 36.101) for a number of resource blocks.
struct Bandwidth {
    std::uint32_t resourceBlocks;
    double megahertz;
    std::string_view text;
};

const Bandwidth& bandwidthOf(Quantity::Raw resourceBlocks)
{
    static constexpr Bandwidth kBandwidths[] = {
        {6, 1.4, "1.4 MHz"}, {15, 3, "3 MHz"},   {25, 5, "5 MHz"},
        {50, 10, "10 MHz"},  {75, 15, "15 MHz"}, {100, 20, "20 MHz"},
    };
    static constexpr Bandwidth kUnknown{0, kNotANumber, "Unknown"};
    const auto* found = std::ranges::find(kBandwidths, resourceBlocks, &Bandwidth::resourceBlocks);
    return found != std::end(kBandwidths) ? *found : kUnknown;
}

constexpr Quantity kBandwidth{[](Quantity::Raw raw) { return std::string(bandwidthOf(raw).text); },
                              [](Quantity::Raw raw) { return bandwidthOf(raw).megahertz; }, "MHz"};

// clang-format off
constexpr Row kAntennas[] = {{u8(20), "Num Tx Antennas", decimalSigned32}};

constexpr Row kServingCell[] = {
    {u16(14), "Physical Cell ID",    decimalSigned32},
    {u16(16), "Download Frequency",  decimalSigned32},
    {u16(18), "Upload Frequency",    decimalSigned32},
    {u8(20),  "Download Bandwidth",  kBandwidth},
    {u8(21),  "Upload Bandwidth",    kBandwidth},
    // Kept: 32-bit fields are printed as signed numbers; field logs show values from 2^31 as negative.
    {u32(22), "Cell Identity",       decimalSigned32},
    {u16(26), "Tracking Area Code",  decimalSigned32},
    {u32(28), "Freq Band Indicator", decimalSigned32},
};

constexpr CellRow kMonitoredCell[] = {
    {kVoxCell_TAC,            "Tracking Area Code",  "Serving Cell Info: Failed to retrieve TAC\n"},
    {kVoxCell_CellId,         "Cell Identity",       "Serving Cell Info: Failed to retrieve Cell ID\n"},
    {kVoxCell_PhysicalCellId, "Physical Cell ID",    "Serving Cell Info: Failed to retrieve Physical Cell ID\n"},
    {kVoxCell_BandInfo,       "Freq Band Indicator", "Serving Cell Info: Failed to retrieve Freq Band Indicator\n"},
    {kVoxCell_UARFCN,         "UARFCN",              "Serving Cell Info: Failed to retrieve UARFCN\n"},
};
// clang-format on

constexpr Layout kLayouts[] = {
    {.code = kServingCellRecord, .minimumLength = 38, .rows = kServingCell},
    {.code = kAntennasRecord, .minimumLength = 22, .rows = kAntennas},
    {.code = kCellMonitorRecord},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Serving Cell Info",
    .layouts = kLayouts,
    .entryLine = "LTE Serving Cell Info",
};

} // namespace

LTEServingCellInfo::LTEServingCellInfo(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void LTEServingCellInfo::decode(Record data, const Layout& layout)
{
    if (layout.code == kCellMonitorRecord)
        return showServingCell(data, {kVoxCellTechnology_LTE}, kMonitoredCell, sectionRef.dictionary(), roles);
    publish(data, layout.rows);
    if (layout.code == kAntennasRecord)
        reportUnknown(layout.code); // kept: field logs show the line although the record is decoded
    else if (auto* node = sectionRef.dictionary())
        node->remove("UARFCN"); // set by the cell monitor; this record's frequencies replace it
}

} // namespace kestrum
