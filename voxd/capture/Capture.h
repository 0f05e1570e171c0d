#pragma once

#include "support/Bytes.h"

#include <cstdint>
#include <istream>
#include <optional>
#include <ostream>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

/// Kcap: each channel message behind its length (32 bits, little-endian). Dlf: ordinary records alone, 12-byte headers
/// (length, code, time stamp) and payloads; the length counts the header.
enum class CaptureFormat { Kcap, Dlf };

/// By the ending of the file's name: ".kcap", ".dlf".
std::optional<CaptureFormat> captureFormat(std::string_view path);

/// Reads a capture message by message, whatever its size.
class CaptureReader {
public:
    /// Longer messages are held to be damage.
    static constexpr std::size_t kMaximumMessage = 16 << 20;

    /// The stream outlives the reader.
    CaptureReader(std::istream& from, CaptureFormat format) : _from(&from), _format(format) {}

    /// The next channel message; a DLF record with the type byte of ordinary records put before it. Notes are skipped.
    /// Nothing at the end and where the capture cannot be read on.
    std::optional<std::vector<std::byte>> next();

    /// Where the next message begins, or what cannot be read.
    std::uint64_t offset() const { return _offset; }
    /// Why it cannot be read on; empty at the end.
    const std::string& fault() const { return _fault; }

private:
    std::size_t readLength(std::span<std::byte> into, std::size_t width);
    std::optional<std::vector<std::byte>> take(std::size_t length, std::vector<std::byte> into);

    std::istream* _from;
    CaptureFormat _format;
    std::uint64_t _offset = 0;
    std::string _fault;
};

/// Appends a message to a channel capture.
void writeKcap(std::ostream& to, Bytes message);

/// A note between the messages of a channel capture: here the service dropped messages for a client that did not read.
/// It stands where a length would, and says how many.
inline constexpr std::uint32_t kKcapGap = 0x8000'0008;
inline constexpr std::size_t kKcapGapSize = 12; ///< bytes, kKcapGap included
void writeKcapGap(std::ostream& to, std::uint64_t messages);
/// How many messages the note says; nothing when `bytes` do not begin with a whole note.
std::optional<std::uint64_t> kcapGap(Bytes bytes);

} // namespace kestrum
