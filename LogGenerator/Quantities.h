#pragma once

#include "support/Format.h"
#include "support/Reading.h"

#include <cstddef>
#include <cstdint>
#include <limits>
#include <string>
#include <string_view>

namespace kestrum {

inline constexpr double kNotANumber = std::numeric_limits<double>::quiet_NaN();

/// The 32 bits of a field.
constexpr std::uint32_t fieldOf(Quantity::Raw raw)
{
    return static_cast<std::uint32_t>(raw);
}

/// Applies `Number` to a field.
template <auto Number>
constexpr double numberOf(Quantity::Raw raw)
{
    return static_cast<double>(Number(fieldOf(raw)));
}

/// A quantity with a text but no number, such as a state's name. `Word` gives the text of a field.
template <auto Word>
inline constexpr Quantity named{[](Quantity::Raw raw) { return std::string(Word(fieldOf(raw))); }};

/// The name at index `value`; "Unknown" beyond the table's end.
template <std::size_t Count>
constexpr std::string_view nameIn(const std::string_view (&names)[Count], std::uint32_t value)
{
    return value < Count ? names[value] : std::string_view("Unknown");
}

/// Whether a field has the value `Value`.
template <std::uint32_t Value>
constexpr bool isValue(std::uint32_t raw)
{
    return raw == Value;
}

/// The quantity `Ordinary`. Fields for which `IsSpecial` holds have the text of `Word` and no number.
template <bool (*IsSpecial)(std::uint32_t), std::string_view (*Word)(std::uint32_t), const Quantity& Ordinary>
inline constexpr Quantity exceptFor{
    [](Quantity::Raw raw) { return IsSpecial(fieldOf(raw)) ? std::string(Word(fieldOf(raw))) : Ordinary.text(raw); },
    [](Quantity::Raw raw) { return IsSpecial(fieldOf(raw)) ? kNotANumber : Ordinary.number(raw); }, Ordinary.unit};

// Interpretations of a field as an integer.
constexpr std::int32_t signed32(std::uint32_t raw)
{
    return static_cast<std::int32_t>(raw);
}
constexpr std::int16_t signed16(std::uint32_t raw)
{
    return static_cast<std::int16_t>(raw);
}
constexpr std::int8_t signed8(std::uint32_t raw)
{
    return static_cast<std::int8_t>(raw);
}
constexpr std::uint32_t unsigned32(std::uint32_t raw)
{
    return raw;
}

/// A decimal number without a unit.
template <auto Number>
inline constexpr Quantity decimal{[](Quantity::Raw raw) { return std::to_string(Number(fieldOf(raw))); },
                                  numberOf<Number>};
/// Kept: 32-bit fields are printed as signed numbers; field logs show values from 2^31 as negative.
inline constexpr const Quantity& decimalSigned32 = decimal<signed32>;
inline constexpr const Quantity& decimalSigned16 = decimal<signed16>;
inline constexpr const Quantity& decimalUnsigned = decimal<unsigned32>;

/// Levels in dBm and ratios in dB: integers as "-98 dBm" and "-11 dB", others with two digits after the point.
template <auto Number>
inline constexpr Quantity inWholeDbm{[](Quantity::Raw raw) { return formatted("%d dBm", Number(fieldOf(raw))); },
                                     numberOf<Number>, "dBm"};
template <auto Number>
inline constexpr Quantity inWholeDb{[](Quantity::Raw raw) { return formatted("%d dB", Number(fieldOf(raw))); },
                                    numberOf<Number>, "dB"};
template <double (*Number)(std::uint32_t)>
inline constexpr Quantity inDbm{[](Quantity::Raw raw) { return formatted("%4.2f dBm", Number(fieldOf(raw))); },
                                numberOf<Number>, "dBm"};
template <double (*Number)(std::uint32_t)>
inline constexpr Quantity inDb{[](Quantity::Raw raw) { return formatted("%4.2f dB", Number(fieldOf(raw))); },
                               numberOf<Number>, "dB"};

} // namespace kestrum
