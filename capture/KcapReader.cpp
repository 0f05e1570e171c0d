#include "capture/KcapReader.h"

#include "platform/ChannelMessage.h"
#include "support/Format.h"

#include <algorithm>

namespace kestrum {
namespace {

constexpr std::size_t kLengthSize = 4;
constexpr std::size_t kHead = kLengthSize + ChannelMessage::kPrefixSize + ChannelMessage::kHeaderSize + 5;
constexpr Field kRecordLength = u16(1);

// Lengths are followed this far after a message whose contents do not agree with its length. Arbitrary bytes read as
// lengths lead to an impossible length much sooner.
constexpr std::size_t kLookAhead = 1 << 20;

bool endsAsXml(Bytes list)
{
    constexpr std::size_t kMostBlanks = 256; // more would make a search slow
    auto text = textOf(list.last(std::min(list.size(), kMostBlanks)));
    text = text.substr(0, text.find_last_not_of(" \t\r\n") + 1);
    return text.ends_with("</plist>") || text.ends_with("<plist/>");
}

// The trailer of a binary property list has the number of its objects and the offset of the table of their offsets. The
// table must end where the trailer begins.
bool endsAsBinary(Bytes list)
{
    constexpr std::size_t kTrailer = 32, kWidth = 6, kCount = 8, kTable = 24;
    if (!textOf(list).starts_with("bplist") || list.size() < kTrailer)
        return false;
    const auto trailer = list.last(kTrailer);
    const auto number = [&](std::size_t at) { // big-endian
        std::uint64_t value = 0;
        for (const auto each : trailer.subspan(at, 8))
            value = value << 8 | std::to_integer<std::uint64_t>(each);
        return value;
    };
    const auto width = std::to_integer<std::uint64_t>(trailer[kWidth]), size = std::uint64_t{list.size()};
    return number(kCount) < size && number(kTable) < size && number(kTable) + width * number(kCount) == size - kTrailer;
}

bool endsAsPropertyList(Bytes list)
{
    return isPropertyList(list) && (endsAsXml(list) || endsAsBinary(list));
}

// Checks the header only, so that a search does not read to the end of every supposed message.
bool maybeBeginsMessage(Bytes head, std::size_t length)
{
    if (isPropertyList(head))
        return textOf(head).starts_with("<?xml") || textOf(head).starts_with("<plist") ||
               textOf(head).starts_with("bplist");
    const auto read = ChannelMessage::read(head);
    if (!read || !read->isOfKnownType())
        return false;
    const auto counted = read->record.read(kRecordLength);
    const std::size_t recordSize = length - (head.size() - read->record.size());
    // The sender counts the record less its type byte, or all of it.
    return counted && (((recordSize - 1 - *counted) & 0xFFFF) == 0 || ((recordSize - *counted) & 0xFFFF) == 0);
}

bool isSound(Bytes message)
{
    const auto read = ChannelMessage::read(message);
    if (!read || !read->isOfKnownType())
        return endsAsPropertyList(message);
    const auto counted = read->record.read(kRecordLength);
    if (counted && (*counted + 1 == read->record.size() || *counted == read->record.size()))
        return true;
    // A property list may be longer than the record's 16 bits can count.
    const auto payload = read->record.from(ChannelMessage::kHeaderSize);
    return payload && endsAsPropertyList(payload->bytes());
}

/// The number of missing messages; nothing without a complete note.
std::optional<std::uint64_t> gapIn(Bytes bytes)
{
    const Record note(bytes);
    return note.read(u32(0)) == kKcapGap ? note.read64(4) : std::nullopt;
}

} // namespace

KcapReader::Look KcapReader::look(std::size_t at)
{
    const Bytes head = _window.peek(at + kHead);
    if (head.size() <= at)
        return {Sound::Incomplete, 0};
    const auto length = Record(head.subspan(at)).read(u32(0));
    if (!length)
        return {Sound::Incomplete, 0};
    if (*length == kKcapGap) {
        const bool isWhole = _window.peek(at + kKcapGapSize).size() >= at + kKcapGapSize;
        return {isWhole ? Sound::Yes : Sound::Incomplete, kKcapGapSize};
    }
    if (*length > kLongestMessage)
        return {Sound::No, *length};
    const std::size_t size = kLengthSize + *length;
    const Bytes all = _window.peek(at + size);
    if (all.size() - at < size)
        return {Sound::Incomplete, size};
    return {isSound(all.subspan(at + kLengthSize, *length)) ? Sound::Yes : Sound::Perhaps, size};
}

// Whether the lengths from `at` lead to the end, to a message whose contents agree, or far enough. Each part of the
// stream is followed once; the messages on the way share the result.
bool KcapReader::leadsOn(std::size_t at)
{
    if (_window.offset() + at <= _followedTo)
        return _leadsOn;
    std::size_t end = at;
    for (;;) {
        const auto [sound, size] = look(end);
        const bool isEnd = _window.peek(end + 1).size() <= end;
        _leadsOn = isEnd || sound == Sound::Yes || (sound == Sound::Incomplete && mayGrow()) || end - at > kLookAhead;
        if (_leadsOn || sound != Sound::Perhaps)
            break;
        end += size;
    }
    _followedTo = _window.offset() + end;
    return _leadsOn;
}

KcapReader::Sound KcapReader::proof(std::size_t at)
{
    const Bytes all = _window.peek(at + kHead);
    const auto head = Record(all).from(at).value_or(Record({})).bytes();
    const auto length = Record(head).read(u32(0));
    if (!length)
        return Sound::Incomplete;
    if (*length == kKcapGap)
        return look(at).sound;
    if (*length == 0 || *length > kLongestMessage)
        return Sound::No;
    const Bytes begin = head.subspan(kLengthSize);
    if (begin.size() < std::min<std::size_t>(*length, kHead - kLengthSize))
        return Sound::Incomplete;
    if (!maybeBeginsMessage(begin.first(std::min<std::size_t>(begin.size(), *length)), *length))
        return Sound::No;
    const auto [sound, size] = look(at);
    return sound == Sound::Perhaps && look(at + size).sound == Sound::Yes ? Sound::Yes : sound;
}

CaptureReader::Found KcapReader::found(const Look& look)
{
    const auto [sound, size] = look;
    const std::size_t here = _window.peek(kLengthSize).size();
    if (sound == Sound::No)
        return {.reason = formatted("a message of %lu bytes, longer than the limit of %lu", size, kLongestMessage)};
    if (sound == Sound::Incomplete && size == 0)
        return {.incomplete = true, .reason = formatted("the length has only %lu of its 4 bytes", here)};
    if (sound == Sound::Incomplete)
        return {.incomplete = true,
                .reason = formatted("the last message is cut off (%lu bytes missing)", size - here)};
    return {.size = size, .gap = gapIn(_window.peek(kKcapGapSize))};
}

CaptureReader::Found KcapReader::byLength()
{
    return found(look(0));
}

CaptureReader::Found KcapReader::inOrder()
{
    const auto here = look(0);
    if (here.sound != Sound::Perhaps || leadsOn(here.size))
        return found(here);
    // Damage follows: the length is true unless another message begins inside it.
    for (std::size_t at = 1; at < here.size; ++at)
        if (proof(at) == Sound::Yes)
            return {.reason = formatted("no message follows after a message of %lu bytes", here.size - kLengthSize)};
    return found(here);
}

CaptureReader::Found KcapReader::behindDamage()
{
    const Sound sound = proof(0);
    if (sound != Sound::Yes)
        return {.incomplete = sound == Sound::Incomplete};
    _followedTo = 0;
    return found(look(0));
}

Bytes KcapReader::message(std::size_t size)
{
    return _window.peek(size).subspan(kLengthSize, size - kLengthSize);
}

} // namespace kestrum
