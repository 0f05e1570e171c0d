#include "LogGenerator/UTRAN/GSMNeighbhorMeasurements.h"

namespace kestrum {
namespace {

constexpr std::size_t kMinimumLength = 17;

} // namespace

std::string_view GSMNeighbhorMeasurements::getSectionName() const
{
    return "GSM Neighbor Cell List";
}

std::vector<LogCode> GSMNeighbhorMeasurements::getLogCodeArray() const
{
    return {0xD00E};
}

void GSMNeighbhorMeasurements::updateWithData(Record data, LogCode logCode)
{
    // The cells of the record (8 bytes each from offset 17, their number at 16) are never shown, on purpose: the list
    // is empty after every record.
    if (accepts(data, logCode, 0xD00E, kMinimumLength, Foreign::Ignored))
        clearElementsInArray(sectionRef);
}

} // namespace kestrum
