#include "LogGenerator/LTE/MeasuredNeighborCells.h"

#include "LogGenerator/LTE/Conversions.h"

namespace kestrum {
namespace {

constexpr std::size_t kMinimumLength = 29;

constexpr Field kCount = u8(27);
constexpr Elements kCells{29, 6};
// clang-format off
constexpr Row kCell[] = {
    {u16(0), "Physical Cell ID", decimal},
    {u16(2), "Filtered RSRP",    inDbm<rsrpQuarterDb>},
    {u16(4), "Filtered RSRQ",    inDb<rsrqEighthDb>},
};
// clang-format on
static_assert(reach(kCell) == kCells.length);

} // namespace

std::string_view MeasuredNeighborCells::getSectionName() const
{
    return "Measured Neighbor Cells";
}

std::vector<LogCode> MeasuredNeighborCells::getLogCodeArray() const
{
    return {0xB179};
}

void MeasuredNeighborCells::updateWithData(Record data, LogCode logCode)
{
    if (!accepts(data, logCode, 0xB179, kMinimumLength))
        return;
    clearElementsInArray(sectionRef);
    replaceArray(sectionRef, listed(data, kCells, data.read(kCount).value_or(0), kCell));
}

} // namespace kestrum
