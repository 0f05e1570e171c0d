#include "capture/CaptureWriter.h"

#include "capture/CaptureFormat.h"
#include "platform/ChannelMessage.h"
#include "support/FieldWriter.h"

#include <array>

namespace kestrum {

ByteSink sinkTo(std::ostream& stream)
{
    return [&stream](Bytes bytes) {
        stream.write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
    };
}

void writeKcap(const ByteSink& to, Bytes message)
{
    std::array<std::byte, 4> length{};
    FieldWriter(length).set(u32(0), static_cast<std::int64_t>(message.size()));
    to(length);
    to(message);
}

void writeKcapGap(const ByteSink& to, std::uint64_t messages)
{
    std::array<std::byte, kKcapGapSize> note{};
    FieldWriter(note).set(u32(0), kKcapGap).set64(4, messages);
    to(note);
}

bool writeDlf(const ByteSink& to, Bytes message)
{
    constexpr std::size_t kType = 1, kLength = 2, kLongest = 0xFFFF;
    const auto read = ChannelMessage::read(message);
    if (!read || read->type != ChannelMessage::kOrdinary)
        return false;
    const Bytes record = read->record.bytes().subspan(kType);
    if (record.size() < ChannelMessage::kHeaderSize - kType || record.size() > kLongest)
        return false;
    // Writes the true length, not the one in the record.
    std::array<std::byte, kLength> length{};
    FieldWriter(length).set(u16(0), static_cast<std::int64_t>(record.size()));
    to(length);
    to(record.subspan(kLength));
    return true;
}

} // namespace kestrum
