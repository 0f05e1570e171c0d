#include "LogGenerator/ZPH_GSM/CodingScheme.h"

namespace kestrum {

std::string_view CodingScheme::getSectionName() const
{
    return "Coding Scheme";
}

std::vector<LogCode> CodingScheme::getLogCodeArray() const
{
    return {};
}

void CodingScheme::updateWithData(Record, LogCode)
{
    logEntry();
}

} // namespace kestrum
