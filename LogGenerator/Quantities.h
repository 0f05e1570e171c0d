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

/// The number that `Number` makes of a field.
template <auto Number>
constexpr double numberOf(Quantity::Raw raw)
{
    return static_cast<double>(Number(fieldOf(raw)));
}

/// Names, and texts that measure nothing: what `Word` makes of a field.
template <auto Word>
inline constexpr Quantity named{[](Quantity::Raw raw) { return std::string(Word(fieldOf(raw))); }};

/// The text at `value` in a table of names that begins at 0; "Unknown" beyond its end.
template <std::size_t Count>
constexpr std::string_view nameIn(const std::string_view (&names)[Count], std::uint32_t value)
{
    return value < Count ? names[value] : std::string_view("Unknown");
}

// The integers that a field can hold.
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

/// A plain number, in decimal.
template <auto Number>
inline constexpr Quantity decimal{[](Quantity::Raw raw) { return std::to_string(Number(fieldOf(raw))); },
                                  numberOf<Number>};
/// A word is printed as signed 32 bits: from 2^31 it shows negative.
inline constexpr const Quantity& decimalSigned32 = decimal<signed32>;
inline constexpr const Quantity& decimalSigned16 = decimal<signed16>;
inline constexpr const Quantity& decimalUnsigned = decimal<unsigned32>;

/// Levels and ratios: whole ones as "-98 dBm" and "-11 dB", others with two digits after the point.
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
