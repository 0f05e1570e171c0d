#include "LogGenerator/PropertyListRecord.h"

#include "platform/PropertyLists.h"
#include "platform/SystemLog.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

bool holds(const Dictionary& dictionary, std::string_view key, std::string_view text)
{
    const Value* value = dictionary.find(key);
    return value != nullptr && *value == text;
}

} // namespace

Value propertyListIn(Record record, DecodingRoles& roles)
{
    const auto list = record.from(ChannelMessage::kHeaderSize);
    return list ? roles.propertyLists.parse(list->bytes()) : Value();
}

CellInfoArray::CellInfoArray(Record record, DecodingRoles& roles) : _cells(propertyListIn(record, roles).array())
{
    if (!_cells)
        roles.log.write(Priority::Error, "Cell Info Array data could not be constructed");
}

bool isCell(const Value& cell, std::string_view technology, std::string_view type)
{
    const Dictionary* dictionary = cell.borrowedDictionary();
    return dictionary != nullptr && holds(*dictionary, kVoxCell_Technology, technology) &&
           holds(*dictionary, kVoxCell_Type, type);
}

std::optional<std::int32_t> cellNumber(const Value& cell, std::string_view key)
{
    const Dictionary* dictionary = cell.borrowedDictionary();
    const Value* number = dictionary != nullptr ? dictionary->find(key) : nullptr;
    return number != nullptr ? number->int32() : std::nullopt;
}

} // namespace kestrum
