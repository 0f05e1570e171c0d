#include "LogGenerator/UTRAN/UTRANNeighbhorMeasurements.h"

namespace kestrum {
namespace {

constexpr Field kCount = u8(16).bits(1, 7);
// Kept: the cells begin far behind the preceding fields. Only the first 4 of each cell's 16 bytes are read.
constexpr Elements kCells{168, 16, 4};

constexpr Field kCellSet = u32(0).bits(29, 30);
constexpr std::uint32_t kNoCellSet = 3;

// Kept: 1/256 of the raw value, without an offset and without a unit.
constexpr Quantity kFilteredRscp{[](Quantity::Raw raw) { return formatted("%f", fieldOf(raw) / 256.0); },
                                 [](Quantity::Raw raw) { return fieldOf(raw) / 256.0; }};

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
    {u32(0).bits(0, 13),  "UARFCN",      decimalSigned32},
    {u32(0).bits(14, 20), "Cell ID",     decimalSigned32},
    {u32(0).bits(21, 28), "Filter RSCP", kFilteredRscp},
    {kCellSet,            "Status",      named<cellSet>},
    {u32(0).bit(31),      "inJDCS",      named<trueOrFalse>},
};
// clang-format on
static_assert(reach(kCell) == kCells.length);

void showCell(Record cell, Dictionary& row)
{
    show(cell, kCell, row);
    if (cell.read(kCellSet) == kNoCellSet)
        row.remove("Status");
}

constexpr Layout kLayouts[] = {
    {.code = 0xD00A, .minimumLength = 21},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Neighbor Cell List",
    .layouts = kLayouts,
    .entryLine = "NeighbhorMeasurements List",
    .foreignCode = ForeignCode::Ignored,
};

} // namespace

UTRANNeighbhorMeasurements::UTRANNeighbhorMeasurements(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void UTRANNeighbhorMeasurements::decode(Record data, const Layout&)
{
    replaceArray(sectionRef, listed(data, kCells, data.read(kCount).value_or(0), showCell));
}

} // namespace kestrum
