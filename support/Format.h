#pragma once

#include <array>
#include <concepts>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <type_traits>

namespace kestrum {

/// One argument of `format`, its type erased.
class FormatArgument {
public:
    enum class Kind { Signed, Unsigned, Character, Real, Text, Address };

    constexpr FormatArgument(std::signed_integral auto value) : _kind(Kind::Signed), _signed(value) {}
    constexpr FormatArgument(std::unsigned_integral auto value) : _kind(Kind::Unsigned), _unsigned(value) {}
    constexpr FormatArgument(char value) : _kind(Kind::Character), _signed(value) {}
    constexpr FormatArgument(std::floating_point auto value) : _kind(Kind::Real), _real(value) {}
    constexpr FormatArgument(std::string_view value) : _kind(Kind::Text), _text(value) {}
    FormatArgument(const std::string& value) : _kind(Kind::Text), _text(value) {}
    constexpr FormatArgument(const char* value) : _kind(Kind::Text), _text(value != nullptr ? value : "(null)") {}
    constexpr FormatArgument(const void* value) : _kind(Kind::Address), _address(value) {}

    constexpr Kind kind() const { return _kind; }
    constexpr std::int64_t signedValue() const { return _signed; }
    constexpr std::uint64_t unsignedValue() const { return _unsigned; }
    constexpr double real() const { return _real; }
    constexpr std::string_view text() const { return _text; }
    constexpr const void* address() const { return _address; }

private:
    Kind _kind;
    union {
        std::int64_t _signed;
        std::uint64_t _unsigned;
        double _real;
        std::string_view _text;
        const void* _address;
    };
};

namespace formatting {

/// One conversion of a printf format: "%[flags][width][.precision][length]conversion".
struct Conversion {
    bool plus = false, zero = false;
    int width = 0;
    int precision = -1;
    bool wide = false; ///< "l": an argument of more than 32 bits may be given
    char letter = 0;   ///< 0 at the format's end
};

constexpr bool isDigit(char c)
{
    return c >= '0' && c <= '9';
}

/// Reads the conversion behind a "%" at `at`, and moves `at` behind it.
constexpr Conversion parse(std::string_view format, std::size_t& at)
{
    const auto next = [&] { return at < format.size() ? format[at] : '\0'; };
    Conversion found;
    for (;; ++at) {
        if (next() == '+')
            found.plus = true;
        else if (next() == '0')
            found.zero = true;
        else
            break;
    }
    for (; isDigit(next()); ++at)
        found.width = found.width * 10 + (next() - '0');
    if (next() == '.') {
        found.precision = 0;
        for (++at; isDigit(next()); ++at)
            found.precision = found.precision * 10 + (next() - '0');
    }
    for (; next() == 'l'; ++at)
        found.wide = true;
    found.letter = next();
    if (found.letter != '\0')
        ++at;
    return found;
}

/// Whether an argument of type T may stand for the conversion. Integers are checked for their width, so
/// that what the format says ("%d" is signed, 32 bits) is what is shown.
template <typename T>
constexpr bool fits(const Conversion& conversion)
{
    constexpr std::size_t narrow = 4;
    constexpr int kMostDigits = 60; // behind the point
    const bool integer = std::is_integral_v<T> && !std::is_same_v<T, bool> && !std::is_same_v<T, char> &&
                         (conversion.wide || sizeof(T) <= narrow) && conversion.precision < 0;
    switch (conversion.letter) {
    case 'd':
        return integer && (std::is_signed_v<T> || sizeof(T) < narrow);
    case 'u':
    case 'x':
        return integer && std::is_unsigned_v<T>;
    case 'c':
        return std::is_same_v<T, char>;
    case 'f':
        return std::is_floating_point_v<T> && conversion.precision <= kMostDigits;
    case 's':
    case '@':
        return std::is_convertible_v<T, std::string_view>;
    case 'p':
        return std::is_pointer_v<T> && !std::is_convertible_v<T, const char*>;
    default:
        return false;
    }
}

} // namespace formatting

/// A printf format whose arguments the compiler checks.
template <typename... Arguments>
class FormatString {
public:
    template <typename Text>
        requires std::convertible_to<const Text&, std::string_view>
    consteval FormatString(const Text& text) : _text(text)
    {
        using Check = bool (*)(const formatting::Conversion&);
        constexpr std::array<Check, sizeof...(Arguments)> checks{
            formatting::fits<std::remove_cvref_t<std::decay_t<Arguments>>>...};
        std::size_t used = 0;
        for (std::size_t at = 0; at < _text.size();) {
            if (_text[at++] != '%')
                continue;
            if (at < _text.size() && _text[at] == '%') {
                ++at;
                continue;
            }
            const auto conversion = formatting::parse(_text, at);
            if (used == checks.size())
                throw "the format wants more arguments";
            if (!checks[used++](conversion))
                throw "the argument does not fit its conversion";
        }
        if (used != checks.size())
            throw "the format wants fewer arguments";
    }

    constexpr std::string_view text() const { return _text; }

private:
    std::string_view _text;
};

std::string formatArguments(std::string_view format, const FormatArgument* arguments);

/// printf, checked by the compiler: %d %u %x %c %f %s %p, with "+", "0", width, precision and "l", and "%@"
/// for the text of an object. Not-a-number has no sign, whatever the platform; a null pointer is "0x0", a null text
/// "(null)". Integers take no precision.
template <typename... Arguments>
std::string format(FormatString<std::type_identity_t<Arguments>...> format, const Arguments&... arguments)
{
    const std::array<FormatArgument, sizeof...(Arguments) + 1> erased{FormatArgument(arguments)..., FormatArgument(0)};
    return formatArguments(format.text(), erased.data());
}

} // namespace kestrum
