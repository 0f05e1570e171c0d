#include "LogGenerator/LTE/DetectedCells.h"

namespace kestrum {
namespace {

constexpr std::size_t kMinimumLength = 29;

constexpr Field kMeasuredCount = u8(27);
constexpr Field kDetectedCount = u8(28);
constexpr Elements kMeasuredCells{29, 6};
constexpr Row kCell[] = {{u16(0), "Physical Cell ID", decimal}};

} // namespace

std::string_view DetectedCells::getSectionName() const
{
    return "Detected Cells";
}

std::vector<LogCode> DetectedCells::getLogCodeArray() const
{
    return {0xB179};
}

void DetectedCells::updateWithData(Record data, LogCode logCode)
{
    if (!accepts(data, logCode, 0xB179, kMinimumLength))
        return;
    clearElementsInArray(sectionRef);
    // The detected cells follow the measured ones.
    const std::size_t first = kMeasuredCells.first + kMeasuredCells.stride * data.read(kMeasuredCount).value_or(0);
    replaceArray(sectionRef, listed(data, Elements(first, reach(kCell)), data.read(kDetectedCount).value_or(0), kCell));
}

} // namespace kestrum
