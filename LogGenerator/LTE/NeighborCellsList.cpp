#include "LogGenerator/LTE/NeighborCellsList.h"

#include "LogGenerator/LTE/Quantities.h"

namespace kestrum {
namespace {

constexpr Field kCountLessOne = u16(19).bits(6, 10);

constexpr Field kPhysicalCellId = u32(0).bits(0, 8);
constexpr Field kMeasuredRssi = u32(0).bits(9, 16);
constexpr Field kMeasuredRsrp = u32(0).bits(17, 25);
constexpr Field kAverageRsrp = u16(4).bits(0, 8);
constexpr Field kMeasuredRsrq = u16(4).bits(9, 15);
constexpr Field kAverageRsrq = u16(6).bits(0, 6);
constexpr Field kFrameOffset = u32(12).bits(0, 10);
constexpr Field kSampleOffset = u32(12).bits(11, 29);

// RSRP has steps of 0.5 dB here; the serving cell's records have 0.25 dB.
// clang-format off
constexpr Row kCell[] = {
    {kPhysicalCellId,    "Physical Cell ID",    decimalSigned32},
    {kMeasuredRssi,      "Measured RSSI",       inDbm<powerHalfDb>},
    {kMeasuredRsrp,      "Measured RSRP",       inDbm<powerHalfDb>},
    {kAverageRsrp,       "Average RSRP",        inDbm<powerHalfDb>},
    {kMeasuredRsrq,      "Measured RSRQ",       inDb<rsrqQuarterDb>},
    {kAverageRsrq,       "Average RSRQ",        inDb<rsrqQuarterDb>},
    {u16(6).bits(7, 13), "Srxlev",              inWholeDbm<srxlev>},
    {u16(8),             "Frequency Offset",    decimalSigned32},
    {kFrameOffset,       "Ant 0 Frame Offset",  decimalSigned32},
    {kSampleOffset,      "Ant 0 Sample Offset", decimalSigned32},
    // Kept: antenna 1 shows the bits of antenna 0; the bits after them are not read.
    {kFrameOffset,       "Ant 1 Frame Offset",  decimalSigned32},
    {kSampleOffset,      "Ant 1 Sample Offset", decimalSigned32},
};
// clang-format on

constexpr Elements kCells{21, 20, 16};
static_assert(reach(kCell) == kCells.length);

/// The fields with real values, logged for each cell.
constexpr struct {
    Field field;
    double (*quantity)(std::uint32_t raw);
} kLogged[] = {
    {kMeasuredRssi, powerHalfDb},   {kMeasuredRsrp, powerHalfDb},  {kAverageRsrp, powerHalfDb},
    {kMeasuredRsrq, rsrqQuarterDb}, {kAverageRsrq, rsrqQuarterDb},
};

constexpr Layout kLayouts[] = {
    {.code = 0xB180, .minimumLength = 21},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Neighbor Cells List",
    .layouts = kLayouts,
};

} // namespace

NeighborCellsList::NeighborCellsList(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void NeighborCellsList::decode(Record data, const Layout&)
{
    const std::uint32_t count = data.read(kCountLessOne).value_or(0) + 1;
    roles.log.write(Priority::Warning, "Number of neighboring cells being reported: %d\n",
                    static_cast<std::int32_t>(count));
    replaceArray(sectionRef, listed(data, kCells, count, [this](Record cell, Dictionary& row) {
                     logMeasurements(cell);
                     show(cell, kCell, row);
                 }));
}

void NeighborCellsList::logMeasurements(Record cell) const
{
    if (!roles.log.passes(Priority::Warning))
        return;
    const auto raw = [cell](Field field) { return cell.read(field).value_or(0); };
    roles.log.write(Priority::Warning, "Physical Cell ID: %d\n", static_cast<std::int32_t>(raw(kPhysicalCellId)));
    // Kept: the line has the same label for RSSI, RSRP and RSRQ.
    for (const auto& [field, quantity] : kLogged)
        roles.log.write(Priority::Warning, "Measured RSSI: %lf\n", quantity(raw(field)));
}

} // namespace kestrum
