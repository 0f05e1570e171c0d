#include "LogGenerator/ZPH_GSM/DetectedSet.h"

#include "LogGenerator/ZPH_GSM/SearcherCells.h"

namespace kestrum {

std::string_view DetectedSet::getSectionName() const
{
    return "Detected Set";
}

std::vector<LogCode> DetectedSet::getLogCodeArray() const
{
    return {searcher::kCode};
}

void DetectedSet::updateWithData(Record data, LogCode logCode)
{
    // Which cells belong to it is not known: it stays empty.
    if (accepts(data, logCode, searcher::kCode, searcher::kMinimumLength))
        clearElementsInArray(sectionRef);
}

} // namespace kestrum
