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

constexpr int kLinks = 4, kMustProve = -1;

bool endsAsXml(Bytes list)
{
    auto text = textOf(list);
    text = text.substr(0, text.find_last_not_of(" \t\r\n") + 1);
    return text.ends_with("</plist>") || text.ends_with("<plist/>");
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
        return isPropertyList(message) && endsAsXml(message);
    const auto counted = read->record.read(kRecordLength);
    if (counted && (*counted + 1 == read->record.size() || *counted == read->record.size()))
        return true;
    // A property list may be longer than the record's 16 bits can count.
    const auto payload = read->record.from(ChannelMessage::kHeaderSize);
    return payload && isPropertyList(payload->bytes()) && endsAsXml(payload->bytes());
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
    if (*length > CaptureReader::kMaximumMessage)
        return {Sound::No, *length};
    const std::size_t size = kLengthSize + *length;
    const Bytes all = _window.peek(at + size);
    if (all.size() - at < size)
        return {Sound::Incomplete, size};
    return {isSound(all.subspan(at + kLengthSize, *length)) ? Sound::Yes : Sound::Perhaps, size};
}

// A message that does not prove itself must end where others begin, or where the capture ends.
bool KcapScanner::isFollowed(std::size_t at, int links)
{
    const Bytes all = _window.peek(at + kHead);
    if (all.size() <= at + kLengthSize || links == 0)
        return true;
    const auto [sound, size] = look(at);
    if (links == kMustProve)
        return sound == Sound::Yes;
    if (sound == Sound::Incomplete)
        return maybeBeginsMessage(_window.peek(at + kHead).subspan(at + kLengthSize), size - kLengthSize);
    // Zeros would pass for empty messages: behind one of those the next must prove itself.
    return sound == Sound::Yes ||
           (sound == Sound::Perhaps && isFollowed(at + size, size > kLengthSize ? links - 1 : kMustProve));
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
    if (sound == Sound::Yes || isFollowed(size, kLinks))
        return {.size = size};
    return {.reason = formatted("no message follows the one of %lu bytes", size - kLengthSize)};
}

MessageScanner::Candidate KcapScanner::chanced()
{
    const Bytes head = _window.peek(kHead);
    const Candidate none{.incomplete = head.size() < kHead};
    const auto length = Record(head).read(u32(0));
    if (!length || *length == 0 || *length > CaptureReader::kMaximumMessage)
        return none;
    const Bytes begin = head.subspan(kLengthSize);
    if (!maybeBeginsMessage(begin.first(std::min<std::size_t>(begin.size(), *length)), *length))
        return none;
    const auto [sound, size] = look(0);
    if (sound == Sound::Incomplete)
        return {.incomplete = true};
    if (sound == Sound::Yes || (sound == Sound::Perhaps && look(size).sound == Sound::Yes))
        return {.size = size};
    return {};
}

Bytes KcapScanner::message(std::size_t size)
{
    return _window.peek(size).subspan(kLengthSize, size - kLengthSize);
}

} // namespace kestrum
