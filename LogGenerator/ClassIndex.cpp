#include "LogGenerator/ClassIndex.h"

#include "platform/Console.h"
#include "support/Format.h"

#include <algorithm>

namespace kestrum {

ClassIndex::ClassIndex(DecodingRoles& decodingRoles)
    : roles{decodingRoles.log,    decodingRoles.console, decodingRoles.clock,
            decodingRoles.bundle, _parsedOnce,           decodingRoles.watch},
      _parsedOnce(decodingRoles.propertyLists)
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
    const auto found = codeDictionary.find(logCode);
    return found == codeDictionary.end() ? nullptr : &found->second;
}

std::vector<std::string> ClassIndex::getAllLogCodes() const
{
    std::vector<std::string> codes;
    for (const auto& [code, subscribers] : codeDictionary)
        codes.push_back(formatted("%u", code));
    std::ranges::sort(codes);
    return codes;
}

void ClassIndex::status() const
{
    // The registry is always a dictionary, so the line is constant.
    roles.log.write(Priority::Warning, "Dictionary = %d", 1);
    roles.log.write(Priority::Warning, "String = %d", 0);
}

} // namespace kestrum
