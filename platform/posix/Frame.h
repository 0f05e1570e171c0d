#pragma once

#include "support/Bytes.h"

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace kestrum {

/// One message between two processes. docs/protocol.md describes its bytes.
struct Frame {
    enum class Kind : std::uint8_t { Message = 1, Request = 2, Reply = 3 };

    Kind kind;
    std::int32_t messageId;
    std::uint32_t serial; ///< a reply repeats its request's; 0 in a message
    Bytes payload;        ///< borrowed
};

inline constexpr std::size_t kFrameHeader = 13;
/// Bytes: four times the largest known property list of a telephony service, and small enough that a hostile peer
/// cannot exhaust memory.
inline constexpr std::size_t kMaximumPayload = 16 << 20;

/// Appends the frame's bytes. The payload has at most `kMaximumPayload` bytes.
void appendFrame(std::vector<std::byte>& to, const Frame& frame);

/// Cuts a byte stream into frames.
class FrameReader {
public:
    /// Room for the next bytes of the stream, at least `least`. Invalidates the last frame's payload.
    std::span<std::byte> room(std::size_t least);
    /// Tells that `count` bytes were written to `room`.
    void filled(std::size_t count) { _end += count; }

    /// The next complete frame; nothing when none is. Its payload is valid until the next call of `room`.
    std::optional<Frame> next();

    /// Why the stream is malformed; empty while it is not. A malformed stream gives no more frames.
    const std::string& fault() const { return _fault; }

private:
    std::vector<std::byte> _buffer;
    std::size_t _begin = 0, _end = 0; // the bytes not yet read
    std::string _fault;
};

} // namespace kestrum
