#include "LogGenerator/ZPH_GSM/PDPContextList.h"

#include "LogGenerator/PropertyListRecord.h"

namespace kestrum {

std::string_view PDPContextList::getSectionName() const
{
    return "PDP Context Info";
}

std::vector<LogCode> PDPContextList::getLogCodeArray() const
{
    return {0xFF0002};
}

void PDPContextList::updateWithData(Record data, LogCode)
{
    logEntry();
    if (const auto contexts = PDPContextArray(data, roles).contexts())
        replaceArray(sectionRef, {contexts->begin(), contexts->end()});
}

} // namespace kestrum
