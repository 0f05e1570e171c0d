#include "frontends/terminal/Text.h"

#include "support/Utf8.h"

#include <algorithm>
#include <clocale>
#include <cstdlib>
#include <cwchar>
#include <cwctype>
#include <iterator>
#include <langinfo.h>
#include <numeric>
#include <utility>

namespace kestrum {

namespace {

constexpr const char* kLocaleVariables[] = {"LC_ALL", "LC_CTYPE", "LANG"};
constexpr char32_t kReplacement = 0xFFFD;
constexpr std::size_t kLongestGlyph = 5; // A cell of the terminal library holds no more.

// Embeddings, overrides and isolates (Unicode Standard Annex 9) would turn the rest of the line around.
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

int sum(const std::vector<Glyph>& text)
{
    return std::accumulate(text.begin(), text.end(), 0, [](int sum, const Glyph& each) { return sum + each.columns; });
}

// The first of `text` in at most `width` columns.
template <typename Iterator>
std::pair<Iterator, int> taken(Iterator first, Iterator end, int width)
{
    int used = 0;
    while (first != end && used + first->columns <= width)
        used += first++->columns;
    return {first, used};
}

template <typename Iterator>
std::wstring joined(Iterator first, Iterator end)
{
    std::wstring text;
    for (; first != end; ++first)
        text += first->text;
    return text;
}

// `back` columns at most are kept of the end.
std::string cut(std::string_view text, int width, int back)
{
    const auto all = glyphs(text);
    if (sum(all) <= width)
        return std::string(text);
    if (width < 1)
        return {};
    const auto [tail, tailColumns] = taken(all.rbegin(), all.rend(), back);
    const auto [head, headColumns] = taken(all.begin(), all.end(), width - 1 - tailColumns);
    return utf8(joined(all.begin(), head) + L'…' + joined(tail.base(), all.end()));
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

std::vector<Glyph> glyphs(std::string_view text)
{
    std::vector<Glyph> result;
    for (const wchar_t each : decoded(text)) {
        const wchar_t c = shown(each);
        const int width = wcwidth(c);
        if (width > 0)
            result.push_back({{c}, width});
        else if (result.empty())
            result.push_back({{L'\u25CC', c}, 1}); // a mark with nothing before it stands on a dotted circle
        else if (result.back().text.size() < kLongestGlyph)
            result.back().text += c;
    }
    return result;
}

std::string harmless(std::string_view text)
{
    const auto all = glyphs(text);
    return utf8(joined(all.begin(), all.end()));
}

int columns(std::string_view text)
{
    return sum(glyphs(text));
}

std::string cutInTheMiddle(std::string_view text, int width)
{
    return cut(text, width, (width - 1) / 2);
}

std::string cutAtTheEnd(std::string_view text, int width)
{
    return cut(text, width, 0);
}

bool contains(std::string_view whole, std::string_view part)
{
    return folded(whole).find(folded(part)) != std::wstring::npos;
}

} // namespace kestrum
