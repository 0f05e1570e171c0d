#pragma once

#include "support/Bytes.h"

#include <cstdint>
#include <string>
#include <string_view>

namespace kestrum {

inline std::string littleEndian(std::uint64_t value, int width)
{
    std::string bytes;
    for (int i = 0; i < width; ++i, value >>= 8)
        bytes += static_cast<char>(value);
    return bytes;
}

/// 2026-11-16 06:05:42 UTC as 1.25 ms since 1980-01-06, in the upper 48 bits.
inline constexpr std::uint64_t kStamp = 1'478'844'342ull * 800 << 16;

/// A channel message: type, length, code, stamp, payload.
inline std::string message(unsigned code, std::string_view payload, std::uint64_t stamp = kStamp, unsigned type = 1)
{
    return littleEndian(type, 1) + littleEndian(12 + payload.size(), 2) + littleEndian(code, 2) +
           littleEndian(stamp, 8) + std::string(payload);
}

inline std::string kcap(std::string_view message)
{
    return littleEndian(message.size(), 4) + std::string(message);
}

/// A note that `missing` messages were lost.
inline std::string note(std::uint64_t missing)
{
    return littleEndian(0x8000'0008, 4) + littleEndian(missing, 8);
}

/// A DLF record: the message without its type byte.
inline std::string dlf(unsigned code, std::string_view payload, std::uint64_t stamp = kStamp)
{
    return message(code, payload, stamp).substr(1);
}

} // namespace kestrum
