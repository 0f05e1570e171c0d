#include "LogGenerator/LTE/DetectedCells.h"

namespace kestrum {
namespace {

constexpr Field kMeasuredCount = u8(27);
constexpr Field kDetectedCount = u8(28);
constexpr Elements kMeasuredCells{29, 6};
constexpr Row kCell[] = {{u16(0), "Physical Cell ID", decimalSigned32}};

constexpr Layout kLayouts[] = {
    {.code = 0xB179, .minimumLength = 29},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Detected Cells",
    .layouts = kLayouts,
};

} // namespace

DetectedCells::DetectedCells(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void DetectedCells::decode(Record data, const Layout&)
{
    // The detected cells follow the measured ones.
    const std::size_t first = kMeasuredCells.first + kMeasuredCells.stride * data.read(kMeasuredCount).value_or(0);
    replaceArray(sectionRef, listed(data, Elements(first, reach(kCell)), data.read(kDetectedCount).value_or(0), kCell));
}

} // namespace kestrum
