#include "LogGenerator/ZPH_GSM/CellChangeCounters.h"

namespace kestrum {

std::string_view CellChangeCounters::getSectionName() const
{
    return "Cell Change Counters";
}

std::vector<LogCode> CellChangeCounters::getLogCodeArray() const
{
    return {};
}

void CellChangeCounters::updateWithData(Record, LogCode)
{
    logEntry();
}

} // namespace kestrum
