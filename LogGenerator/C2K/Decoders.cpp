#include "LogGenerator/C2K/Decoders.h"

#include "platform/RecordWatch.h"
#include "platform/SystemLog.h"

namespace kestrum {

void C2KContext::publish(std::string_view identifier, const Value& value) const
{
    const auto places = _lookup ? _lookup->at(identifier).array() : nullptr;
    if (!places)
        return;
    for (const auto& place : *places) {
        const auto entry = place.dictionary();
        const auto dictionary = entry ? entry->at("dict").dictionary() : nullptr;
        const Value key = entry ? entry->at("key") : Value();
        if (!dictionary || key.string() == nullptr)
            return;
        dictionary->set(*key.string(), value);
    }
}

void C2KContext::publish(Record record, std::span<const Row> rows) const
{
    for (const auto& row : rows)
        if (const auto raw = record.read(row.field))
            row.conversion.apply(*raw, [&](std::string_view text) { publish(row.key, text); });
}

void C2KContext::rejectLength(std::string_view line) const
{
    log.write(Priority::Error, line);
    if (_watch != nullptr)
        _watch->tooShort();
}

} // namespace kestrum
