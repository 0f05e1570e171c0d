#include "support/Format.h"

#include <charconv>
#include <cmath>
#include <cstring>
#include <iterator>

namespace kestrum {
namespace {

using formatting::Conversion;

/// Text under construction: on the stack while it is short, as all display values are.
class Output {
public:
    void append(std::string_view text)
    {
        if (_spilled.empty() && text.size() <= sizeof _buffer - _used) {
            std::memcpy(_buffer + _used, text.data(), text.size());
            _used += text.size();
            return;
        }
        if (_spilled.empty())
            _spilled.assign(_buffer, _used);
        _spilled += text;
    }
    void pad(char with, std::size_t count)
    {
        for (; count > 0; --count)
            append({&with, 1});
    }
    std::string take() { return _spilled.empty() ? std::string(_buffer, _used) : std::move(_spilled); }

private:
    char _buffer[128];
    std::size_t _used = 0;
    std::string _spilled;
};

/// `digits` with its sign, filled up to the conversion's width. Zeros stand behind the sign, blanks before it.
void appendNumber(Output& out, const Conversion& conversion, char sign, std::string_view digits, bool finite = true)
{
    const std::size_t length = digits.size() + (sign != '\0' ? 1 : 0);
    const auto width = static_cast<std::size_t>(conversion.width);
    const std::size_t fill = width > length ? width - length : 0;
    const bool zeros = conversion.zero && finite;
    if (!zeros)
        out.pad(' ', fill);
    if (sign != '\0')
        out.append({&sign, 1});
    if (zeros)
        out.pad('0', fill);
    out.append(digits);
}

char signOf(const Conversion& conversion, bool negative)
{
    return negative ? '-' : conversion.plus ? '+' : '\0';
}

void appendInteger(Output& out, const Conversion& conversion, bool negative, std::uint64_t magnitude)
{
    char digits[24];
    const int base = conversion.letter == 'x' ? 16 : 10;
    const auto end = std::to_chars(digits, digits + sizeof digits, magnitude, base).ptr;
    // Only a conversion that can show "-" shows "+".
    const char sign = conversion.letter == 'd' ? signOf(conversion, negative) : '\0';
    appendNumber(out, conversion, sign, {digits, static_cast<std::size_t>(end - digits)});
}

/// The magnitude with so many digits behind the point, when it has no more than 20 binary places, as measurements in
/// fractions of a dB do: in integers, which takes a fifth of the time of std::to_chars. Else nothing is written.
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
    for (std::uint64_t digit = power / 10; digit > 0; digit /= 10)
        *to++ = static_cast<char>('0' + rounded / digit % 10);
    return to;
}

void appendReal(Output& out, const Conversion& conversion, double value)
{
    if (std::isnan(value))
        return appendNumber(out, conversion, '\0', "nan", false);
    const char sign = signOf(conversion, std::signbit(value));
    if (std::isinf(value))
        return appendNumber(out, conversion, sign, "inf", false);
    char digits[400]; // the largest double has 309 digits before the point
    const int precision = conversion.precision < 0 ? 6 : conversion.precision;
    const char* end = writeShort(digits, std::end(digits), std::fabs(value), precision);
    if (end == nullptr)
        end = std::to_chars(digits, std::end(digits), std::fabs(value), std::chars_format::fixed, precision).ptr;
    appendNumber(out, conversion, sign, {digits, static_cast<std::size_t>(end - digits)});
}

void appendArgument(Output& out, const Conversion& conversion, const FormatArgument& argument)
{
    switch (argument.kind()) {
    case FormatArgument::Kind::Signed: {
        const auto value = argument.signedValue();
        const auto bits = static_cast<std::uint64_t>(value);
        return appendInteger(out, conversion, value < 0, value < 0 ? 0 - bits : bits);
    }
    case FormatArgument::Kind::Unsigned:
        return appendInteger(out, conversion, false, argument.unsignedValue());
    case FormatArgument::Kind::Character: {
        const char character = static_cast<char>(argument.signedValue());
        return appendNumber(out, conversion, '\0', {&character, 1});
    }
    case FormatArgument::Kind::Real:
        return appendReal(out, conversion, argument.real());
    case FormatArgument::Kind::Text: {
        const bool whole = conversion.precision < 0;
        const auto length = whole ? std::string_view::npos : static_cast<std::size_t>(conversion.precision);
        return appendNumber(out, conversion, '\0', argument.text().substr(0, length), false);
    }
    case FormatArgument::Kind::Address: {
        char text[24] = "0x";
        const auto address = reinterpret_cast<std::uintptr_t>(argument.address());
        const auto end = std::to_chars(text + 2, text + sizeof text, address, 16).ptr;
        return appendNumber(out, conversion, '\0', {text, static_cast<std::size_t>(end - text)}, false);
    }
    }
}

} // namespace

std::string formatArguments(std::string_view format, const FormatArgument* arguments)
{
    Output out;
    for (std::size_t at = 0; at < format.size();) {
        const auto percent = format.find('%', at);
        out.append(format.substr(at, percent - at));
        if (percent == std::string_view::npos)
            break;
        at = percent + 1;
        if (at < format.size() && format[at] == '%') {
            out.append("%");
            ++at;
            continue;
        }
        const auto conversion = formatting::parse(format, at);
        appendArgument(out, conversion, *arguments++);
    }
    return out.take();
}

} // namespace kestrum
