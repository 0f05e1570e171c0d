#include "LogGenerator/ZPH_GSM/VirtualActiveSet.h"

#include "LogGenerator/ZPH_GSM/SearcherCells.h"

namespace kestrum {

std::string_view VirtualActiveSet::getSectionName() const
{
    return "Virtual Active Set";
}

std::vector<LogCode> VirtualActiveSet::getLogCodeArray() const
{
    return {searcher::kCode};
}

void VirtualActiveSet::updateWithData(Record data, LogCode logCode)
{
    // Which cells belong to it is not known: it stays empty.
    if (accepts(data, logCode, searcher::kCode, searcher::kMinimumLength))
        clearElementsInArray(sectionRef);
}

} // namespace kestrum
