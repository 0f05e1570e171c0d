#include "platform/posix/Frame.h"

#include "support/FieldWriter.h"
#include "support/Format.h"

#include <algorithm>
#include <array>
#include <cstring>

namespace kestrum {
namespace {

constexpr Field kLength = u32(0), kKind = u8(4), kMessageId = u32(5), kSerial = u32(9);
constexpr std::size_t kLengthSize = kLength.end(); // the length does not count itself

} // namespace

void appendFrame(std::vector<std::byte>& to, const Frame& frame)
{
    std::array<std::byte, kFrameHeader> header{};
    FieldWriter(header)
        .set(kLength, static_cast<std::int64_t>(kFrameHeader - kLengthSize + frame.payload.size()))
        .set(kKind, static_cast<std::int64_t>(frame.kind))
        .set(kMessageId, frame.messageId)
        .set(kSerial, frame.serial);
    to.reserve(to.size() + kFrameHeader + frame.payload.size());
    to.insert(to.end(), header.begin(), header.end());
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
    // The buffer grows with the bytes received, never by a length that a peer only announces.
    if (_buffer.size() - _end < least)
        _buffer.resize(std::max(_end + least, 2 * _buffer.size()));
    return std::span(_buffer).subspan(_end);
}

std::optional<Frame> FrameReader::next()
{
    const Record rest(Bytes(_buffer).subspan(_begin, _end - _begin));
    const std::size_t length = rest.read(kLength).value_or(0);
    if (!_fault.empty() || rest.size() < kLengthSize)
        return std::nullopt;
    // Checked before the payload arrives: the reader does not wait for the rest of a malformed frame.
    if (length < kFrameHeader - kLengthSize || length > kFrameHeader - kLengthSize + kMaximumPayload) {
        _fault = formatted("a frame of %lu bytes, outside the limits of %lu to %lu", length, kFrameHeader - kLengthSize,
                           kFrameHeader - kLengthSize + kMaximumPayload);
        return std::nullopt;
    }
    const auto kind = rest.read(kKind);
    if (kind && (*kind < 1 || *kind > 3)) {
        _fault = formatted("a frame of unknown kind %u", *kind);
        return std::nullopt;
    }
    const auto frame = rest.slice(0, kLengthSize + length);
    if (!frame)
        return std::nullopt;
    _begin += frame->size();
    return Frame{static_cast<Frame::Kind>(*kind), static_cast<std::int32_t>(*frame->read(kMessageId)),
                 *frame->read(kSerial), frame->bytes().subspan(kFrameHeader)};
}

} // namespace kestrum
