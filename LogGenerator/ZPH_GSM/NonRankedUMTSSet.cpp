#include "LogGenerator/ZPH_GSM/NonRankedUMTSSet.h"

namespace kestrum {

std::string_view NonRankedUMTSSet::getSectionName() const
{
    return "Non-Ranked UMTS Set";
}

std::vector<LogCode> NonRankedUMTSSet::getLogCodeArray() const
{
    return {};
}

void NonRankedUMTSSet::updateWithData(Record, LogCode)
{
    logEntry();
}

} // namespace kestrum
