#include "support/Format.h"

#include <charconv>
#include <cmath>
#include <cstring>
#include <iterator>

namespace kestrum::formatting {
namespace {

void pad(Output& out, char with, std::size_t count)
{
    for (; count > 0; --count)
        out.append({&with, 1});
}

/// A number that is being formatted: sign, then digits.
class Number {
public:
    Number(const Conversion& conversion, bool negative)
    {
        if (negative || conversion.plus)
            _text[_size++] = negative ? '-' : '+';
        _signs = _size;
    }

    char* begin() { return _text + _size; } ///< where the next digits go
    char* end() { return std::end(_text); }
    void endAt(const char* behind) { _size = static_cast<std::size_t>(behind - _text); }

    /// Pads to the conversion's width: with zeros after the sign, or with blanks before it.
    void appendTo(Output& out, const Conversion& conversion)
    {
        const auto width = static_cast<std::size_t>(conversion.width);
        const std::size_t fill = width > _size ? width - _size : 0;
        std::size_t at = 0;
        if (fill > 0 && conversion.zero) {
            out.append({_text, _signs});
            at = _signs;
        }
        pad(out, conversion.zero ? '0' : ' ', fill);
        out.append({_text + at, _size - at});
    }

private:
    char _text[400]; // a double has at most 309 digits before the point, and 60 after it are allowed
    std::size_t _size = 0, _signs;
};

void appendInteger(Output& out, const Conversion& conversion, bool negative, std::uint64_t magnitude, int base = 10)
{
    Number number(conversion, negative);
    number.endAt(std::to_chars(number.begin(), number.end(), magnitude, base).ptr);
    number.appendTo(out, conversion);
}

/// Writes a magnitude with at most 20 binary places (fractions of a dB have few) by integer arithmetic, which takes a
/// fifth of the time of std::to_chars. `precision` digits follow the point. Writes nothing for other magnitudes.
char* writeShort(char* to, char* end, double magnitude, int precision)
{
    constexpr unsigned kPlaces = 20;
    constexpr std::uint64_t kOne = 1 << kPlaces, kHalf = kOne / 2;
    constexpr std::uint64_t kPowers[] = {1, 10, 100, 1'000, 10'000, 100'000, 1'000'000};
    if (precision < 1 || static_cast<std::size_t>(precision) >= std::size(kPowers) || magnitude >= kOne)
        return nullptr;
    const double scaled = magnitude * kOne; // exact, and below 2^40
    const auto whole = static_cast<std::uint64_t>(scaled);
    if (static_cast<double>(whole) != scaled)
        return nullptr;
    const std::uint64_t power = kPowers[precision], product = whole * power; // below 2^60
    std::uint64_t rounded = product / kOne;
    if (const auto rest = product % kOne; rest > kHalf || (rest == kHalf && rounded % 2 == 1)) // half to even
        ++rounded;
    to = std::to_chars(to, end, rounded / power).ptr;
    *to++ = '.';
    char* const behind = to + precision;
    std::uint64_t fraction = rounded % power;
    for (char* digit = behind; digit != to; fraction /= 10)
        *--digit = static_cast<char>('0' + fraction % 10);
    return behind;
}

} // namespace

void Output::spill(std::string_view text)
{
    if (_spilled.empty())
        _spilled.assign(_buffer, _used);
    _spilled += text;
}

void appendPercents(Output& out, std::string_view text)
{
    for (auto percent = text.find('%'); percent != std::string_view::npos; percent = text.find('%')) {
        out.append(text.substr(0, percent + 1));
        text.remove_prefix(percent + 2);
    }
    out.append(text);
}

void appendSigned(Output& out, const Conversion& conversion, std::int64_t value)
{
    const auto bits = static_cast<std::uint64_t>(value);
    appendInteger(out, conversion, value < 0, value < 0 ? 0 - bits : bits);
}

void appendUnsigned(Output& out, Conversion conversion, std::uint64_t value)
{
    conversion.plus = false; // "+" applies to signed conversions only
    appendInteger(out, conversion, false, value, conversion.letter == 'x' ? 16 : 10);
}

void appendReal(Output& out, const Conversion& conversion, double value)
{
    if (std::isnan(value))
        return appendText(out, {.width = conversion.width}, "nan");
    Number number(conversion, std::signbit(value));
    const double magnitude = std::fabs(value);
    const int precision = conversion.precision < 0 ? 6 : conversion.precision;
    const char* end = writeShort(number.begin(), number.end(), magnitude, precision);
    if (end == nullptr)
        end = std::to_chars(number.begin(), number.end(), magnitude, std::chars_format::fixed, precision).ptr;
    number.endAt(end);
    Conversion shown = conversion;
    shown.zero &= std::isfinite(value);
    number.appendTo(out, shown);
}

void appendText(Output& out, const Conversion& conversion, std::string_view text)
{
    if (conversion.precision >= 0)
        text = text.substr(0, static_cast<std::size_t>(conversion.precision));
    const auto width = static_cast<std::size_t>(conversion.width);
    pad(out, ' ', width > text.size() ? width - text.size() : 0);
    out.append(text);
}

void appendAddress(Output& out, const Conversion& conversion, const void* address)
{
    char text[24] = "0x";
    const auto end = std::to_chars(text + 2, text + sizeof text, reinterpret_cast<std::uintptr_t>(address), 16).ptr;
    appendText(out, conversion, {text, static_cast<std::size_t>(end - text)});
}

} // namespace kestrum::formatting
