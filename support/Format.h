#pragma once

#include <array>
#include <concepts>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>

namespace kestrum {

namespace formatting {

/// One conversion of a printf format: "%[flags][width][.precision][length]conversion".
struct Conversion {
    bool plus = false, zero = false;
    int width = 0;
    int precision = -1;
    bool wide = false; ///< "l": the argument may have more than 32 bits
    char letter = 0;   ///< 0 at the format's end
};

constexpr bool isDigit(char c)
{
    return c >= '0' && c <= '9';
}

/// Reads the conversion that follows a "%". `at` is the position after the "%" and is moved behind the conversion.
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

/// Whether the conversion accepts an argument of type T. Integers must match in sign and width: "%d" takes signed
/// numbers of at most 32 bits.
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

/// A text that is being built. Up to 128 bytes stay on the stack; display values are shorter.
class Output {
public:
    void append(std::string_view text)
    {
        if (_spilled.empty() && text.size() <= sizeof _buffer - _used) {
            std::memcpy(_buffer + _used, text.data(), text.size());
            _used += text.size();
        } else {
            spill(text);
        }
    }
    std::string_view text() const { return _spilled.empty() ? std::string_view(_buffer, _used) : _spilled; }
    std::string take() { return _spilled.empty() ? std::string(_buffer, _used) : std::move(_spilled); }

private:
    void spill(std::string_view text);

    char _buffer[128];
    std::size_t _used = 0;
    std::string _spilled;
};

/// The literal text before a conversion, or after the last one.
struct Plain {
    std::string_view text;
    bool percents = false; ///< holds "%%", which stands for a percent sign
};
void appendPercents(Output& out, std::string_view text);
inline void append(Output& out, const Plain& plain)
{
    if (plain.percents)
        appendPercents(out, plain.text);
    else
        out.append(plain.text);
}

void appendSigned(Output& out, const Conversion& conversion, std::int64_t value);
void appendUnsigned(Output& out, Conversion conversion, std::uint64_t value);
void appendReal(Output& out, const Conversion& conversion, double value);
void appendText(Output& out, const Conversion& conversion, std::string_view text);
void appendAddress(Output& out, const Conversion& conversion, const void* address);

/// Appends an argument that `fits` the conversion.
template <typename T>
void appendArgument(Output& out, const Conversion& conversion, const T& value)
{
    if constexpr (std::is_same_v<T, char>)
        appendText(out, conversion, {&value, 1});
    else if constexpr (std::is_signed_v<T> && std::is_integral_v<T>)
        appendSigned(out, conversion, value);
    else if constexpr (std::is_integral_v<T>)
        appendUnsigned(out, conversion, value);
    else if constexpr (std::is_floating_point_v<T>)
        appendReal(out, conversion, value);
    else if constexpr (std::is_pointer_v<T> && std::is_convertible_v<T, const char*>)
        appendText(out, conversion, value != nullptr ? value : "(null)");
    else if constexpr (std::is_convertible_v<T, std::string_view>)
        appendText(out, conversion, value);
    else
        appendAddress(out, conversion, value);
}

} // namespace formatting

/// A printf format that is parsed, and checked against its arguments, at compile time.
template <typename... Arguments>
class FormatString {
public:
    template <typename Text>
        requires std::convertible_to<const Text&, std::string_view>
    consteval FormatString(const Text& text)
    {
        using Check = bool (*)(const formatting::Conversion&);
        constexpr std::array<Check, sizeof...(Arguments)> checks{
            formatting::fits<std::remove_cvref_t<std::decay_t<Arguments>>>...};
        const std::string_view format = text;
        std::size_t used = 0, begin = 0;
        for (std::size_t at = 0; at < format.size();) {
            if (format[at++] != '%')
                continue;
            if (at < format.size() && format[at] == '%') {
                ++at;
                _plain[used].percents = true;
                continue;
            }
            if (used == checks.size())
                throw "the format wants more arguments";
            _plain[used].text = format.substr(begin, at - 1 - begin);
            _conversions[used] = formatting::parse(format, at);
            begin = at;
            if (!checks[used](_conversions[used]))
                throw "the argument does not fit its conversion";
            ++used;
        }
        if (used != checks.size())
            throw "the format wants fewer arguments";
        _plain[used].text = format.substr(begin);
    }

    /// `at`: 0 to the number of conversions; the last text follows the last conversion.
    constexpr const formatting::Plain& plain(std::size_t at) const { return _plain[at]; }
    constexpr const formatting::Conversion& conversion(std::size_t at) const { return _conversions[at]; }

private:
    std::array<formatting::Plain, sizeof...(Arguments) + 1> _plain;
    std::array<formatting::Conversion, sizeof...(Arguments)> _conversions;
};

namespace formatting {

template <typename... Arguments>
Output formatted(const FormatString<std::type_identity_t<Arguments>...>& format, const Arguments&... arguments)
{
    Output out;
    std::size_t at = 0;
    [[maybe_unused]] const auto appendNext = [&](const auto& argument) {
        append(out, format.plain(at));
        appendArgument(out, format.conversion(at), argument);
        ++at;
    };
    (appendNext(arguments), ...);
    append(out, format.plain(at));
    return out;
}

} // namespace formatting

/// printf with arguments checked at compile time: %d %u %x %c %f %s %p with "+", "0", width, precision and "l", and
/// "%@" for a text. The result does not depend on the locale. Not-a-number is "nan" without a sign; a null pointer is
/// "0x0", a null text "(null)". Integers take no precision.
template <typename... Arguments>
std::string formatted(FormatString<std::type_identity_t<Arguments>...> format, const Arguments&... arguments)
{
    return formatting::formatted(format, arguments...).take();
}

} // namespace kestrum
