#include "support/Base64.h"

#include <array>
#include <cstdint>

namespace kestrum {
namespace {

constexpr std::string_view kAlphabet = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
constexpr std::uint8_t kNone = 0xFF;

constexpr auto kSixBits = [] {
    std::array<std::uint8_t, 256> table;
    table.fill(kNone);
    for (std::size_t i = 0; i < kAlphabet.size(); ++i)
        table[static_cast<unsigned char>(kAlphabet[i])] = static_cast<std::uint8_t>(i);
    return table;
}();

} // namespace

std::string base64(Bytes bytes)
{
    std::string text;
    text.reserve((bytes.size() + 2) / 3 * 4);
    for (std::size_t at = 0; at < bytes.size(); at += 3) {
        const auto byte = [&](std::size_t i) {
            return at + i < bytes.size() ? std::to_integer<std::uint32_t>(bytes[at + i]) : 0;
        };
        const std::uint32_t group = byte(0) << 16 | byte(1) << 8 | byte(2);
        for (const unsigned shift : {18u, 12u, 6u, 0u})
            text += kAlphabet[group >> shift & 0x3F];
    }
    const std::size_t padding = (3 - bytes.size() % 3) % 3;
    return text.replace(text.size() - padding, padding, padding, '=');
}

std::optional<std::vector<std::byte>> bytesFromBase64(std::string_view text)
{
    std::vector<std::byte> bytes;
    bytes.reserve(text.size() / 4 * 3);
    std::uint32_t pending = 0; // bits that wait for their byte to be complete
    unsigned bits = 0, padding = 0;
    for (const char character : text) {
        if (character == ' ' || character == '\t' || character == '\n' || character == '\r')
            continue;
        if (character == '=') {
            ++padding;
            continue;
        }
        const std::uint32_t value = kSixBits[static_cast<unsigned char>(character)];
        if (value == kNone || padding > 0)
            return std::nullopt;
        pending = pending << 6 | value;
        bits += 6;
        if (bits >= 8) {
            bits -= 8;
            bytes.push_back(static_cast<std::byte>(pending >> bits & 0xFF));
        }
    }
    // 2 bits are left over before one "=", 4 before two, and they are zero.
    if (bits != 2 * padding || (pending & ((1u << bits) - 1)) != 0)
        return std::nullopt;
    return bytes;
}

} // namespace kestrum
