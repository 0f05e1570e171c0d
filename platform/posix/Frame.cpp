#include "platform/posix/Frame.h"

#include "support/Format.h"

#include <algorithm>
#include <cstring>

namespace kestrum {
namespace {

constexpr std::size_t kLengthSize = 4; // the length counts what follows it

void append(std::vector<std::byte>& to, std::uint32_t number)
{
    for (unsigned shift = 0; shift < 32; shift += 8)
        to.push_back(static_cast<std::byte>(number >> shift));
}

std::uint32_t number(const std::byte* at)
{
    std::uint32_t word = 0;
    for (std::size_t i = 4; i-- > 0;)
        word = (word << 8) | std::to_integer<std::uint32_t>(at[i]);
    return word;
}

} // namespace

void appendFrame(std::vector<std::byte>& to, const Frame& frame)
{
    to.reserve(to.size() + kFrameHeader + frame.payload.size());
    append(to, static_cast<std::uint32_t>(kFrameHeader - kLengthSize + frame.payload.size()));
    to.push_back(static_cast<std::byte>(frame.kind));
    append(to, static_cast<std::uint32_t>(frame.messageId));
    append(to, frame.serial);
    to.insert(to.end(), frame.payload.begin(), frame.payload.end());
}

std::span<std::byte> FrameReader::room(std::size_t least)
{
    if (_begin == _end)
        _begin = _end = 0;
    if (_buffer.size() - _end < least && _begin > 0) {
        std::memmove(_buffer.data(), _buffer.data() + _begin, _end - _begin);
        _end -= std::exchange(_begin, 0);
    }
    // Grows with what has come, never on the promise of a length.
    if (_buffer.size() - _end < least)
        _buffer.resize(std::max(_end + least, 2 * _buffer.size()));
    return std::span(_buffer).subspan(_end);
}

std::optional<Frame> FrameReader::next()
{
    if (!_fault.empty() || _end - _begin < kLengthSize)
        return std::nullopt;
    const std::byte* const at = _buffer.data() + _begin;
    const std::size_t length = number(at);
    // Judged as soon as it is there, lest a peer have us wait for bytes that mean nothing.
    if (length < kFrameHeader - kLengthSize || length > kFrameHeader - kLengthSize + kMaximumPayload) {
        _fault = formatted("a frame of %lu bytes, allowed are %lu to %lu", length, kFrameHeader - kLengthSize,
                           kFrameHeader - kLengthSize + kMaximumPayload);
        return std::nullopt;
    }
    if (_end - _begin > kLengthSize && (at[4] < std::byte{1} || at[4] > std::byte{3})) {
        _fault = formatted("a frame of the unknown kind %u", std::to_integer<unsigned>(at[4]));
        return std::nullopt;
    }
    if (_end - _begin < kLengthSize + length)
        return std::nullopt;
    _begin += kLengthSize + length;
    return Frame{static_cast<Frame::Kind>(at[4]), static_cast<std::int32_t>(number(at + 5)), number(at + 9),
                 Bytes(at + kFrameHeader, length - (kFrameHeader - kLengthSize))};
}

} // namespace kestrum
