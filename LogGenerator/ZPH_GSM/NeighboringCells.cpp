#include "LogGenerator/ZPH_GSM/NeighboringCells.h"

#include "LogGenerator/CellMonitor.h"
#include "platform/TelephonyService.h"

#include <algorithm>
#include <ranges>

namespace kestrum {
namespace {

constexpr LogCode kMeasurements = 0x5137, kColourCodes = 0x51FF;

constexpr Field kMeasurementCount = u8(28);
constexpr Elements kMeasured{29, 14};
constexpr Field kArfcn = u16(0);
// clang-format off
constexpr Row kMeasuredCell[] = {
    {kArfcn, "ARFCN",    decimalSigned32},
    {u8(2),  "RSSI",     decimalSigned32},
    {u32(3), "C1 Value", decimalSigned32},
};
// clang-format on
static_assert(reach(kMeasuredCell) <= kMeasured.length);

constexpr Field kColourCodeCount = u8(14);
constexpr Elements kColoured{15, 4};
constexpr Field kBsic = u8(2);

/// Kept: the level is doubled.
constexpr int doubled(std::uint32_t raw)
{
    return 2 * signed16(raw);
}

// clang-format off
constexpr CellRow kMonitoredCell[] = {
    {kVoxCell_ARFCN, "ARFCN", "NeighboringCells: Failed to retrieve ARFCN\n"},
    {kVoxCell_RSSI,  "RSSI",  "NeighboringCells: Failed to retrieve RSSI\n", kWhereMeasured<inWholeDbm<doubled>>},
};
// clang-format on

constexpr Layout kLayouts[] = {
    {.code = kMeasurements, .minimumLength = 29},
    {.code = kColourCodes, .minimumLength = 15},
    {.code = kCellMonitorRecord},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Neighboring Cells",
    .layouts = kLayouts,
    .entryLine = "NeighboringCells",
};

} // namespace

NeighboringCells::NeighboringCells(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void NeighboringCells::decode(Record data, const Layout& layout)
{
    if (layout.code == kMeasurements)
        listMeasurements(data);
    else if (layout.code == kColourCodes)
        learnColourCodes(data);
    else
        replaceArray(sectionRef,
                     [&](Array& list) { appendNeighbors(list, data, kVoxCellTechnology_GSM, kMonitoredCell, roles); });
}

void NeighboringCells::learnColourCodes(Record data)
{
    arfcnToBsic.clear();
    const std::size_t count = data.read(kColourCodeCount).value_or(0);
    for (std::size_t i = 0; i < count; ++i) {
        const auto entry = elementOf(data, kColoured, i);
        if (!entry)
            break;
        arfcnToBsic.push_back({entry->read(kArfcn).value_or(0), entry->read(kBsic).value_or(0)});
    }
}

void NeighboringCells::listMeasurements(Record data) const
{
    const auto measured = [this](Record cell, Dictionary& row) {
        show(cell, kMeasuredCell, row);
        // From the last on: a later colour code of a frequency replaces an earlier one.
        const auto codes = arfcnToBsic | std::views::reverse;
        if (const auto known = std::ranges::find(codes, cell.read(kArfcn).value_or(0), &ColourCode::arfcn);
            known != codes.end())
            row.set("BSIC", Reading(decimalSigned32, known->bsic));
    };
    replaceArray(sectionRef, listed(data, kMeasured, data.read(kMeasurementCount).value_or(0), measured));
}

} // namespace kestrum
