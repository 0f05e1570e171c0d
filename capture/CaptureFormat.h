#pragma once

#include "support/Bytes.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string_view>

namespace kestrum {

/// Kcap: channel messages, a length (32 bits, little-endian) before each. Dlf: records with a 12-byte header (length,
/// code, time stamp) and a payload; the length includes the header.
enum class CaptureFormat { Kcap, Dlf };

/// The format by the file's ending ".kcap" or ".dlf"; nothing for other endings.
std::optional<CaptureFormat> captureFormat(std::string_view path);
/// The format by the file's first four bytes: in a DLF stream they would be an impossible length of a message.
CaptureFormat captureFormatFromBytes(Bytes begin);

/// The longest message, in bytes. A larger length is damage.
inline constexpr std::size_t kLongestMessage = 16 << 20;

/// A note in a channel capture, in the place of a length: here the service dropped messages for a client that did not
/// read. The number of messages follows (64 bits).
inline constexpr std::uint32_t kKcapGap = 0x8000'0008;
inline constexpr std::size_t kKcapGapSize = 12; ///< bytes, kKcapGap included

} // namespace kestrum
