#include "tools/KcapScanner.h"

#include "platform/ChannelMessage.h"
#include "support/Format.h"
#include "voxd/capture/Capture.h"

#include <algorithm>

namespace kestrum {
namespace {

constexpr std::size_t kLengthSize = 4;
constexpr std::size_t kHead = kLengthSize + ChannelMessage::kPrefixSize + ChannelMessage::kHeaderSize + 5;
constexpr Field kRecordLength = u16(1);

// How far lengths are followed ahead of a message that does not prove itself. Lengths that are none lead to one that
// cannot be long before.
constexpr std::size_t kLookAhead = 1 << 20;

bool endsAsXml(Bytes list)
{
    constexpr std::size_t kMostBlanks = 256; // more would make a search slow
    auto text = textOf(list.last(std::min(list.size(), kMostBlanks)));
    text = text.substr(0, text.find_last_not_of(" \t\r\n") + 1);
    return text.ends_with("</plist>") || text.ends_with("<plist/>");
}

// The trailer of a binary property list counts its objects, and says where the table of their offsets begins: the
// table ends where the trailer begins.
bool endsAsBinary(Bytes list)
{
    constexpr std::size_t kTrailer = 32, kWidth = 6, kCount = 8, kTable = 24;
    if (!textOf(list).starts_with("bplist") || list.size() < kTrailer)
        return false;
    const auto trailer = list.last(kTrailer);
    const auto number = [&](std::size_t at) {
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

// Told by the head alone, so that a search need not look at what each would-be message promises.
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

} // namespace

KcapScanner::Look KcapScanner::look(std::size_t at)
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
    if (*length > CaptureReader::kMaximumMessage)
        return {Sound::No, *length};
    const std::size_t size = kLengthSize + *length;
    const Bytes all = _window.peek(at + size);
    if (all.size() - at < size)
        return {Sound::Incomplete, size};
    return {isSound(all.subspan(at + kLengthSize, *length)) ? Sound::Yes : Sound::Perhaps, size};
}

// Whether the lengths lead on from `at`: to the end, to a message that proves itself, or far enough. Each part of the
// stream is followed once: the messages on the way share what was found.
bool KcapScanner::leadsOn(std::size_t at)
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

// Yes: what stands at `at` cannot well be an accident. Incomplete: its rest would have to tell.
KcapScanner::Sound KcapScanner::proof(std::size_t at)
{
    const Bytes all = _window.peek(at + kHead);
    const auto head = Record(all).from(at).value_or(Record({})).bytes();
    const auto length = Record(head).read(u32(0));
    if (!length)
        return Sound::Incomplete;
    if (*length == kKcapGap)
        return look(at).sound;
    if (*length == 0 || *length > CaptureReader::kMaximumMessage)
        return Sound::No;
    const Bytes begin = head.subspan(kLengthSize);
    if (begin.size() < std::min<std::size_t>(*length, kHead - kLengthSize))
        return Sound::Incomplete;
    if (!maybeBeginsMessage(begin.first(std::min<std::size_t>(begin.size(), *length)), *length))
        return Sound::No;
    const auto [sound, size] = look(at);
    return sound == Sound::Perhaps && look(at + size).sound == Sound::Yes ? Sound::Yes : sound;
}

MessageScanner::Candidate KcapScanner::due()
{
    const auto [sound, size] = look(0);
    const std::size_t here = _window.peek(kLengthSize).size();
    if (sound == Sound::No)
        return {.reason = formatted("a message of %lu bytes, allowed are %lu", size, CaptureReader::kMaximumMessage)};
    if (sound == Sound::Incomplete && size == 0)
        return {.incomplete = true, .reason = formatted("the length has only %lu of its 4 bytes", here)};
    if (sound == Sound::Incomplete)
        return {.incomplete = true, .reason = formatted("the last message ends %lu bytes short", size - here)};
    if (sound == Sound::Yes || leadsOn(size))
        return found(size);
    // There is damage ahead: this length is true unless it hides a message.
    for (std::size_t at = 1; at < size; ++at)
        if (proof(at) == Sound::Yes)
            return {.reason = formatted("no message follows the one of %lu bytes", size - kLengthSize)};
    return {.size = size};
}

MessageScanner::Candidate KcapScanner::chanced()
{
    const Sound sound = proof(0);
    if (sound != Sound::Yes)
        return {.incomplete = sound == Sound::Incomplete};
    _followedTo = 0;
    return found(look(0).size);
}

MessageScanner::Candidate KcapScanner::found(std::size_t size)
{
    return {.size = size, .gap = kcapGap(_window.peek(kKcapGapSize))};
}

Bytes KcapScanner::message(std::size_t size)
{
    return _window.peek(size).subspan(kLengthSize, size - kLengthSize);
}

} // namespace kestrum
