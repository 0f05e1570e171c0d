#include "LogGenerator/ClassIndex.h"

#include "platform/Console.h"

namespace kestrum {

ClassIndex::ClassIndex(DecodingRoles& decodingRoles)
    : _parsedOnce(decodingRoles.propertyLists), roles{decodingRoles.log,    decodingRoles.console, decodingRoles.clock,
                                                      decodingRoles.bundle, _parsedOnce,           decodingRoles.watch}
{}

ClassIndex::~ClassIndex()
{
    roles.console.printLine("Deallocing ClassIndex");
}

Base* ClassIndex::getClass(std::string_view sectionName) const
{
    const auto found = classDict.find(sectionName);
    return found == classDict.end() ? nullptr : found->second;
}

const std::vector<Base*>* ClassIndex::getSubscribers(LogCode logCode) const
{
    if (const auto known = _subscribers.find(logCode); known != _subscribers.end())
        return known->second;
    const auto found = codeDictionary.find(formatted("%u", logCode));
    return found == codeDictionary.end() ? nullptr : (_subscribers[logCode] = &found->second);
}

std::vector<std::string> ClassIndex::getAllLogCodes() const
{
    std::vector<std::string> codes;
    for (const auto& [code, subscribers] : codeDictionary)
        codes.push_back(code);
    return codes;
}

void ClassIndex::status() const
{
    // The registry's type is settled at compile time: it is a dictionary, and no string.
    roles.log.write(Priority::Warning, "Dictionary = %d", 1);
    roles.log.write(Priority::Warning, "String = %d", 0);
}

} // namespace kestrum
