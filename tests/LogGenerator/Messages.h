#pragma once

#include "support/Bytes.h"

#include <cstdint>
#include <vector>

namespace kestrum {

/// A channel message: type, length, code and time stamp, then the payload.
inline std::vector<std::byte> message(std::uint8_t type, std::uint16_t code, std::vector<std::uint8_t> payload = {})
{
    const std::size_t length = 12 + payload.size();
    std::vector<std::uint8_t> bytes{type,
                                    static_cast<std::uint8_t>(length),
                                    static_cast<std::uint8_t>(length >> 8),
                                    static_cast<std::uint8_t>(code),
                                    static_cast<std::uint8_t>(code >> 8),
                                    0xA1,
                                    0xA2,
                                    0xA3,
                                    0xA4,
                                    0xA5,
                                    0xA6,
                                    0xA7,
                                    0xA8};
    bytes.insert(bytes.end(), payload.begin(), payload.end());
    const auto view = std::as_bytes(std::span(bytes));
    return {view.begin(), view.end()};
}

inline std::vector<std::byte> bytesFrom(std::initializer_list<std::uint8_t> values)
{
    std::vector<std::byte> bytes;
    for (const auto value : values)
        bytes.push_back(std::byte{value});
    return bytes;
}

} // namespace kestrum
