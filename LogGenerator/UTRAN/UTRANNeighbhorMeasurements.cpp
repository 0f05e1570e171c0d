#include "LogGenerator/UTRAN/UTRANNeighbhorMeasurements.h"

namespace kestrum {
namespace {

constexpr std::size_t kMinimumLength = 21;

constexpr Field kCount = u8(16).bits(1, 7);
// The cells begin far behind the fields that come before them, on purpose. Of each 16 bytes the first 4 are read.
constexpr Elements kCells{168, 16, 4};

constexpr Field kCellSet = u32(0).bits(29, 30);
constexpr std::uint32_t kNoCellSet = 3;

/// A 256th of the raw value and no offset, on purpose.
std::string filteredRscp(std::uint32_t raw)
{
    return formatted("%f", raw / 256.0);
}

std::string_view cellSet(std::uint32_t raw)
{
    constexpr std::string_view kNames[] = {"ASET", "MSET", "DSET"};
    return nameIn(kNames, raw);
}

std::string_view trueOrFalse(std::uint32_t raw)
{
    return raw != 0 ? "TRUE" : "FALSE";
}

// clang-format off
constexpr Row kCell[] = {
    {u32(0).bits(0, 13),  "UARFCN",      decimal},
    {u32(0).bits(14, 20), "Cell ID",     decimal},
    {u32(0).bits(21, 28), "Filter RSCP", filteredRscp},
    {kCellSet,            "Status",      cellSet},
    {u32(0).bit(31),      "inJDCS",      trueOrFalse},
};
// clang-format on
static_assert(reach(kCell) == kCells.length);

void showCell(Record cell, Dictionary& row)
{
    show(cell, kCell, row);
    if (cell.read(kCellSet) == kNoCellSet)
        row.remove("Status");
}

} // namespace

std::string_view UTRANNeighbhorMeasurements::getSectionName() const
{
    return "Neighbor Cell List";
}

std::vector<LogCode> UTRANNeighbhorMeasurements::getLogCodeArray() const
{
    return {0xD00A};
}

void UTRANNeighbhorMeasurements::updateWithData(Record data, LogCode logCode)
{
    if (!accepts(data, logCode, 0xD00A, kMinimumLength, Foreign::Ignored))
        return;
    clearElementsInArray(sectionRef);
    replaceArray(sectionRef, listed(data, kCells, data.read(kCount).value_or(0), showCell));
}

} // namespace kestrum
