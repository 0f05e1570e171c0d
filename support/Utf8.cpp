#include "support/Utf8.h"

namespace kestrum {

std::optional<char32_t> nextCharacter(std::string_view text, std::size_t& at)
{
    const auto byte = [&](std::size_t i) { return static_cast<unsigned char>(text[i]); };
    const unsigned char first = byte(at++);
    if (first < 0x80)
        return first;
    const std::size_t more = first >= 0xF0 ? 3 : first >= 0xE0 ? 2 : 1;
    if (first < 0xC0 || first > 0xF4 || more > text.size() - at)
        return std::nullopt;
    char32_t character = first & (0x3Fu >> more);
    for (std::size_t i = at; i < at + more; ++i) {
        if ((byte(i) & 0xC0) != 0x80)
            return std::nullopt;
        character = character << 6 | (byte(i) & 0x3Fu);
    }
    constexpr char32_t kLeast[] = {0, 0x80, 0x800, 0x10000};
    if (character < kLeast[more] || character > 0x10FFFF || (character >= 0xD800 && character <= 0xDFFF))
        return std::nullopt;
    at += more;
    return character;
}

std::string_view beginOf(std::string_view text, std::size_t most)
{
    constexpr std::size_t kLongestCharacter = 4;
    if (text.size() <= most)
        return text;
    const auto continues = [&](std::size_t at) { return (static_cast<unsigned char>(text[at]) & 0xC0) == 0x80; };
    for (std::size_t back = 0; back < kLongestCharacter && back <= most; ++back)
        if (!continues(most - back))
            return text.substr(0, most - back);
    return text.substr(0, most);
}

void appendUtf8(std::string& text, char32_t character)
{
    const auto append = [&](char32_t byte) { text += static_cast<char>(byte); };
    if (character < 0x80)
        return append(character);
    const int more = character < 0x800 ? 1 : character < 0x10000 ? 2 : 3;
    append((0xFF80u >> more & 0xFFu) | character >> 6 * more); // the number of leading ones is the number of bytes
    for (int i = more; i-- > 0;)
        append(0x80 | (character >> 6 * i & 0x3F));
}

} // namespace kestrum
