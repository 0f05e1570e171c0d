#include "frontends/terminal/Text.h"

#include "support/Utf8.h"

#include <algorithm>
#include <clocale>
#include <cstdlib>
#include <cwchar>
#include <cwctype>
#include <iterator>
#include <langinfo.h>
#include <utility>
#include <vector>

namespace kestrum::terminal {

namespace {

constexpr const char* kLocaleVariables[] = {"LC_ALL", "LC_CTYPE", "LANG"};
constexpr char32_t kReplacement = 0xFFFD;
constexpr std::size_t kLongestGlyph = 5;     // characters; the most that a cell of the terminal library holds
constexpr std::size_t kLongestCharacter = 4; // bytes
constexpr std::size_t kMostKept = 16 << 10;  // bytes

// Embeddings, overrides and isolates (Unicode Standard Annex 9) would reverse the rest of the line.
bool turnsDirection(wchar_t c)
{
    return c == 0x061C || c == 0x200E || c == 0x200F || (c >= 0x202A && c <= 0x202E) || (c >= 0x2066 && c <= 0x2069);
}

wchar_t shown(wchar_t c)
{
    if (c < 0x20)
        return static_cast<wchar_t>(0x2400 + c);
    if (c == 0x7F)
        return 0x2421;
    return wcwidth(c) < 0 || turnsDirection(c) ? static_cast<wchar_t>(kReplacement) : c;
}

std::wstring decoded(std::string_view text)
{
    std::wstring decoded;
    for (std::size_t at = 0; at < text.size();)
        decoded += static_cast<wchar_t>(nextCharacter(text, at).value_or(kReplacement));
    return decoded;
}

std::wstring folded(std::string_view text)
{
    auto folded = decoded(text);
    std::ranges::transform(folded, folded.begin(),
                           [](wchar_t c) { return static_cast<wchar_t>(std::towlower(static_cast<wint_t>(c))); });
    return folded;
}

// The start of the character that contains byte `at`.
std::size_t characterAt(std::string_view text, std::size_t at)
{
    const auto isInside = [&](std::size_t i) { return (static_cast<unsigned char>(text[i]) & 0xC0) == 0x80; };
    for (std::size_t back = 0; back < kLongestCharacter && back < at; ++back)
        if (!isInside(at - back))
            return at - back;
    return at; // not UTF-8
}

// The number of bytes at the beginning of `text` that fit into `width` columns.
std::size_t bytesIn(std::string_view text, int width)
{
    Glyphs glyphs(text);
    std::size_t bytes = 0;
    for (auto each = glyphs.next(); each && each->columns <= width; each = glyphs.next()) {
        width -= each->columns;
        bytes = glyphs.read();
    }
    return bytes;
}

// A part of a text and its columns: the requested width, or one less if a wide character does not fit.
struct Piece {
    std::wstring text;
    int columns = 0;
};

Piece last(std::string_view text, int width)
{
    Piece piece;
    if (width <= 0)
        return piece;
    // All glyphs that may fit, and one more because the cut may split the last one.
    const auto bytes = kLongestGlyph * kLongestCharacter * static_cast<std::size_t>(width + 1);
    Glyphs glyphs(bytes < text.size() ? text.substr(characterAt(text, text.size() - bytes)) : text);
    std::vector<Glyph> all;
    while (auto each = glyphs.next())
        all.push_back(std::move(*each));
    for (auto each = all.rbegin(); each != all.rend() && piece.columns + each->columns <= width; ++each) {
        piece.text.insert(0, each->text);
        piece.columns += each->columns;
    }
    return piece;
}

bool fits(std::string_view text, int width)
{
    Glyphs glyphs(text);
    while (width >= 0)
        if (const auto each = glyphs.next())
            width -= each->columns;
        else
            return true;
    return false;
}

// Keeps at most `back` columns of the end.
std::string cut(std::string_view text, int width, int back)
{
    if (fits(text, width))
        return std::string(text);
    if (width < 1)
        return {};
    const auto tail = last(text, back);
    return harmless(text.substr(0, bytesIn(text, width - 1 - tail.columns))) + utf8(L'…' + tail.text);
}

} // namespace

std::string utf8(std::wstring_view text)
{
    std::string utf8;
    for (const wchar_t each : text)
        appendUtf8(utf8, static_cast<char32_t>(each));
    return utf8;
}

Charset chooseLocale()
{
    const bool known = std::setlocale(LC_ALL, "") != nullptr;
    if (known && std::string_view(nl_langinfo(CODESET)) == "UTF-8")
        return Charset::Unicode;
    const bool named = std::any_of(std::begin(kLocaleVariables), std::end(kLocaleVariables), [](const char* variable) {
        const char* value = std::getenv(variable);
        return value && *value;
    });
    setenv("LC_ALL", "C.UTF-8", 1);
    std::setlocale(LC_ALL, "");
    return known && named ? Charset::Ascii : Charset::Unicode;
}

wchar_t Glyphs::shownAt(std::size_t& at) const
{
    return shown(static_cast<wchar_t>(nextCharacter(_text, at).value_or(kReplacement)));
}

std::optional<Glyph> Glyphs::next()
{
    if (_read == _text.size())
        return std::nullopt;
    const wchar_t c = shownAt(_read);
    const int width = wcwidth(c);
    // A mark without a base character stands on a dotted circle.
    Glyph glyph = width > 0 ? Glyph{{c}, width} : Glyph{{L'\u25CC', c}, 1};
    // ASCII, so not a combining mark
    const auto isAscii = [&](std::size_t at) { return static_cast<unsigned char>(_text[at]) < 0x80; };
    for (std::size_t at = _read; at < _text.size() && !isAscii(at); _read = at) {
        const wchar_t mark = shownAt(at);
        if (wcwidth(mark) > 0)
            break;
        if (glyph.text.size() < kLongestGlyph)
            glyph.text += mark;
    }
    return glyph;
}

std::string harmless(std::string_view text)
{
    std::string harmless;
    harmless.reserve(text.size());
    for (Glyphs glyphs(text); const auto each = glyphs.next();)
        harmless += utf8(each->text);
    return harmless;
}

int columns(std::string_view text)
{
    // Most texts: tables ask for the columns of thousands.
    if (std::ranges::all_of(text, [](char c) { return c >= ' ' && c <= '~'; }))
        return static_cast<int>(text.size());
    int columns = 0;
    for (Glyphs glyphs(text); const auto each = glyphs.next();)
        columns += each->columns;
    return columns;
}

std::string beginning(std::string_view text)
{
    if (text.size() <= kMostKept)
        return std::string(text);
    return std::string(text.substr(0, characterAt(text, kMostKept))).append("…");
}

std::string cutInTheMiddle(std::string_view text, int width)
{
    return cut(text, width, (width - 1) / 2);
}

std::string cutAtTheEnd(std::string_view text, int width)
{
    return cut(text, width, 0);
}

std::vector<std::string> wrapped(std::string_view text, int width)
{
    std::vector<std::string> lines;
    while (width > 1 && !text.empty()) {
        const auto line = text.substr(0, text.find('\n'));
        const bool fits = terminal::fits(line, width);
        auto end = fits ? line.size() : bytesIn(line, width);
        if (!fits) {
            // Breaks at a blank, unless the next word is longer than a line and is split anyway.
            const auto blank = line.rfind(' ', end);
            const auto next = blank == line.npos ? line : line.substr(blank + 1);
            if (blank != line.npos && terminal::fits(next.substr(0, next.find(' ')), width))
                end = blank;
        }
        lines.emplace_back(line.substr(0, end));
        text.remove_prefix(end);
        if (!text.empty() && (text.front() == '\n' || text.front() == ' '))
            text.remove_prefix(1);
    }
    return lines;
}

bool contains(std::string_view whole, std::string_view part)
{
    return folded(whole).find(folded(part)) != std::wstring::npos;
}

} // namespace kestrum::terminal
