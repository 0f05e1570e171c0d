#include "platform/ChannelMessage.h"

namespace kestrum {
namespace {

constexpr Field kType = u8(0);
constexpr Field kCode = u16(3);
constexpr std::size_t kTimeStamp = 5;

} // namespace

std::optional<ChannelMessage> ChannelMessage::read(Bytes message)
{
    if (message.size() < kHeaderSize)
        return std::nullopt;
    const Record record(message.front() == kPrefixMarker ? message.subspan(kPrefixSize) : message);
    const auto type = static_cast<std::uint8_t>(record.read(kType).value_or(0));
    const LogCode code = record.read(kCode).value_or(0);
    return ChannelMessage{record, type, type == kExtraCode ? kExtraCodes + code : code};
}

std::optional<std::uint64_t> ChannelMessage::timeStamp() const
{
    return record.read64(kTimeStamp);
}

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
