#include "LogGenerator/ClassIndex.h"

#include "platform/Console.h"

#include <charconv>

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
    char digits[16];
    const auto end = std::to_chars(digits, digits + sizeof digits, logCode).ptr;
    const auto found = codeDictionary.find(std::string_view(digits, static_cast<std::size_t>(end - digits)));
    return found == codeDictionary.end() ? nullptr : &found->second;
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
    roles.log.write(Priority::Warning, format("Dictionary = %d", 1));
    roles.log.write(Priority::Warning, format("String = %d", 0));
}

} // namespace kestrum
