#include "tools/Harmless.h"

#include "support/Format.h"
#include "support/Utf8.h"

namespace kestrum::tools {
namespace {

// Unicode's bidirectional controls make a text appear in another order than it is stored.
bool turnsDirection(char32_t character)
{
    return character == 0x061C || character == 0x200E || character == 0x200F ||
           (character >= 0x202A && character <= 0x202E) || (character >= 0x2066 && character <= 0x2069);
}

bool isHarmless(char32_t character)
{
    return character >= 0x20 && (character < 0x7F || character > 0x9F) && !turnsDirection(character);
}

} // namespace

std::string onOneLine(std::string_view raw)
{
    std::string line;
    for (std::size_t at = 0; at < raw.size();) {
        const std::size_t begin = at;
        const auto character = nextCharacter(raw, at);
        const auto bytes = raw.substr(begin, at - begin);
        if (character && isHarmless(*character))
            line += bytes;
        else
            for (const char each : bytes)
                line += formatted("\\x%02x", static_cast<unsigned>(static_cast<unsigned char>(each)));
    }
    return line;
}

std::string onLines(std::string_view raw)
{
    std::string lines;
    for (std::size_t begin = 0;;) {
        const auto end = raw.find('\n', begin);
        auto line = raw.substr(begin, end - begin);
        const bool hasReturn = end != raw.npos && line.ends_with('\r');
        line.remove_suffix(hasReturn ? 1 : 0);
        lines += onOneLine(line);
        if (end == raw.npos)
            return lines;
        lines += hasReturn ? "\r\n" : "\n";
        begin = end + 1;
    }
}

} // namespace kestrum::tools
