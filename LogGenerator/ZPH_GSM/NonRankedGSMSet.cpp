#include "LogGenerator/ZPH_GSM/NonRankedGSMSet.h"

namespace kestrum {

std::string_view NonRankedGSMSet::getSectionName() const
{
    return "Non-Ranked GSM Set";
}

std::vector<LogCode> NonRankedGSMSet::getLogCodeArray() const
{
    return {};
}

void NonRankedGSMSet::updateWithData(Record, LogCode)
{
    logEntry();
}

} // namespace kestrum
