#include "LogGenerator/C2K/Decoders.h"

#include "platform/RecordWatch.h"
#include "platform/SystemLog.h"

namespace kestrum {

template <typename Set>
void C2KContext::atPlacesOf(std::string_view identifier, Set set) const
{
    const Value* found = _lookup ? _lookup->find(identifier) : nullptr;
    const auto places = found != nullptr ? found->array() : nullptr;
    if (!places)
        return;
    for (const auto& place : *places) {
        const auto entry = place.dictionary();
        const Value* node = entry ? entry->find("dict") : nullptr;
        const Value* key = entry ? entry->find("key") : nullptr;
        const auto dictionary = node != nullptr ? node->dictionary() : nullptr;
        if (!dictionary || key == nullptr || key->string() == nullptr)
            return;
        set(*dictionary, *key->string());
    }
}

void C2KContext::publish(std::string_view identifier, std::string_view text) const
{
    atPlacesOf(identifier, [text](Dictionary& node, const std::string& key) { node.setText(key, text); });
}

void C2KContext::publish(std::string_view identifier, const DictionaryRef& list) const
{
    atPlacesOf(identifier, [&list](Dictionary& node, const std::string& key) { node.set(key, list); });
}

void C2KContext::publish(Record record, std::span<const Row> rows) const
{
    for (const auto& row : rows)
        if (const auto raw = record.read(row.field))
            atPlacesOf(row.key, [&](Dictionary& node, const std::string& key) { row.conversion.set(node, key, *raw); });
}

void C2KContext::rejectLength(std::string_view line) const
{
    log.write(Priority::Error, line);
    if (_watch != nullptr)
        _watch->tooShort();
}

} // namespace kestrum
