#include "LogGenerator/ZPH_GSM/MonitoredSet.h"

#include "LogGenerator/ZPH_GSM/SearcherCells.h"

namespace kestrum {

std::string_view MonitoredSet::getSectionName() const
{
    return "Monitored Set";
}

std::vector<LogCode> MonitoredSet::getLogCodeArray() const
{
    return {searcher::kCode};
}

void MonitoredSet::updateWithData(Record data, LogCode logCode)
{
    // Which cells belong to it is not known: it stays empty.
    if (accepts(data, logCode, searcher::kCode, searcher::kMinimumLength))
        clearElementsInArray(sectionRef);
}

} // namespace kestrum
