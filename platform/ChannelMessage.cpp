#include "platform/ChannelMessage.h"

namespace kestrum {
std::optional<ChannelRecord> channelRecord(Bytes message)
{
    const auto read = ChannelMessage::read(message);
    const auto timeStamp = read && read->isOfKnownType() ? read->timeStamp() : std::nullopt;
    return timeStamp ? std::optional(ChannelRecord{read->logCode, *timeStamp}) : std::nullopt;
}

bool isPropertyList(Bytes message)
{
    auto text = textOf(message);
    if (text.starts_with("\xEF\xBB\xBF"))
        text.remove_prefix(3);
    const auto begin = text.find_first_not_of(" \t\r\n");
    return begin != text.npos && (text[begin] == '<' || text.starts_with("bplist"));
}

} // namespace kestrum
