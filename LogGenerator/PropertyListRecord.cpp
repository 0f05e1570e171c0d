#include "LogGenerator/PropertyListRecord.h"

#include "platform/ChannelMessage.h"
#include "platform/PropertyLists.h"
#include "platform/SystemLog.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

bool isText(const Value& value, std::string_view text)
{
    return value.string() != nullptr && *value.string() == text;
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
    const auto dictionary = cell.dictionary();
    return dictionary && isText(dictionary->at(kVoxCell_Technology), technology) &&
           isText(dictionary->at(kVoxCell_Type), type);
}

std::optional<std::int32_t> cellNumber(const Value& cell, std::string_view key)
{
    const auto dictionary = cell.dictionary();
    return dictionary ? dictionary->at(key).int32() : std::nullopt;
}

} // namespace kestrum
