#include "LogGenerator/C2K/Decoders.h"

#include "platform/RecordWatch.h"
#include "platform/SystemLog.h"

namespace kestrum {

void C2KContext::publish(std::string_view identifier, std::string_view text) const
{
    atPlacesOf(identifier, [text](Dictionary& node, const std::string& key) { node.setText(key, text); });
}

void C2KContext::publish(std::string_view identifier, Reading reading) const
{
    atPlacesOf(identifier, [reading](Dictionary& node, const std::string& key) { node.set(key, reading); });
}

void C2KContext::publish(Record record, std::span<const Row> rows) const
{
    for (const auto& row : rows)
        if (const auto raw = record.read(row.field))
            publish(row.key, Reading(row.quantity, *raw));
}

void C2KContext::rejectLength(std::string_view line) const
{
    log.write(Priority::Error, line);
    if (_watch != nullptr)
        _watch->tooShort();
}

} // namespace kestrum
