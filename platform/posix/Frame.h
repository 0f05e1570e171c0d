#pragma once

#include "support/Bytes.h"

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace kestrum {

/// One message as it travels between two processes. docs/protocol.md has the bytes.
struct Frame {
    enum class Kind : std::uint8_t { Message = 1, Request = 2, Reply = 3 };

    Kind kind;
    std::int32_t messageId;
    std::uint32_t serial; ///< a reply bears its request's; 0 in a message
    Bytes payload;        ///< borrowed
};

inline constexpr std::size_t kFrameHeader = 13;
/// Four times what the largest property list of a telephony service is known to need, and small enough that a hostile
/// peer cannot take the memory.
inline constexpr std::size_t kMaximumPayload = 16 << 20;

/// Appends the frame's bytes. The payload is not above `kMaximumPayload`.
void appendFrame(std::vector<std::byte>& to, const Frame& frame);

/// Cuts a byte stream into frames.
class FrameReader {
public:
    /// Where the next bytes of the stream go, at least `least` of them. Ends the last frame's payload.
    std::span<std::byte> room(std::size_t least);
    /// So many bytes were put there.
    void filled(std::size_t count) { _end += count; }

    /// The next frame, when all of it is there. Its payload is valid until the next call of `room`.
    std::optional<Frame> next();

    /// What is wrong with the stream; nothing more can be read from it then.
    const std::string& fault() const { return _fault; }

private:
    std::vector<std::byte> _buffer;
    std::size_t _begin = 0, _end = 0; // the bytes not yet read
    std::string _fault;
};

} // namespace kestrum
