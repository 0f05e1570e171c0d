#pragma once

#include "support/Bytes.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string_view>

namespace kestrum {

/// Kcap: each channel message behind its length (32 bits, little-endian). Dlf: records alone, 12-byte headers (length,
/// code, time stamp) and payloads; the length counts the header.
enum class CaptureFormat { Kcap, Dlf };

/// By the ending of the file's name: ".kcap", ".dlf".
std::optional<CaptureFormat> captureFormat(std::string_view path);
/// By the first four bytes of the file: those of a DLF record would be an impossible length of a message.
CaptureFormat captureFormatFromBytes(Bytes begin);

/// Longer messages are taken for damage.
inline constexpr std::size_t kLongestMessage = 16 << 20;

/// A note in a channel capture, where a length would stand: here the service dropped messages for a client that did
/// not read. The number of messages follows, 64 bits.
inline constexpr std::uint32_t kKcapGap = 0x8000'0008;
inline constexpr std::size_t kKcapGapSize = 12; ///< bytes, kKcapGap included

} // namespace kestrum
