#include "LogGenerator/LTE/MeasuredNeighborCells.h"

#include "LogGenerator/LTE/Quantities.h"

namespace kestrum {
namespace {

constexpr Field kCount = u8(27);
constexpr Elements kCells{29, 6};
// clang-format off
constexpr Row kCell[] = {
    {u16(0), "Physical Cell ID", decimalSigned32},
    {u16(2), "Filtered RSRP",    inDbm<rsrpQuarterDb>},
    {u16(4), "Filtered RSRQ",    inDb<rsrqEighthDb>},
};
// clang-format on

constexpr Layout kLayouts[] = {
    {.code = 0xB179, .minimumLength = 29, .rows = kCell, .list = {{kCount, kCells}}},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Measured Neighbor Cells",
    .layouts = kLayouts,
};

} // namespace

MeasuredNeighborCells::MeasuredNeighborCells(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

} // namespace kestrum
