#pragma once

#include <bit>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace kestrum {

/// What a raw number means: its text and, where it measures something, its number and unit. Quantities are named
/// constants; readings refer to them.
struct Quantity {
    /// A field of a record, at most 32 bits, unsigned; or the bits of a double, for what is computed from several
    /// fields.
    using Raw = std::uint64_t;

    std::string (*text)(Raw raw);
    double (*number)(Raw raw) = nullptr; ///< not a number where this raw value measures nothing ("Not Present")
    std::string_view unit = {};          ///< as the text words it ("dBm", "dB", "kbps", "%"); empty for a plain number
};

/// A quantity that outlives all readings: a temporary or a local one does not compile.
class QuantityRef {
public:
    consteval QuantityRef(const Quantity& quantity) : _quantity(&quantity) {}

    const Quantity& operator*() const { return *_quantity; }
    const Quantity* operator->() const { return _quantity; }
    friend bool operator==(QuantityRef, QuantityRef) = default;

private:
    const Quantity* _quantity;
};

/// A raw number and what it means. It becomes text when it is read; until then it costs no more than the number.
class Reading {
public:
    Reading(QuantityRef quantity, Quantity::Raw raw) : _quantity(quantity), _raw(raw) {}
    /// Of a quantity that `computedQuantity` made.
    static Reading computed(QuantityRef quantity, double number)
    {
        return {quantity, std::bit_cast<Quantity::Raw>(number)};
    }

    std::string text() const { return _quantity->text(_raw); }
    /// Nothing for names and for what measures nothing; always finite.
    std::optional<double> number() const;
    /// The unit of the number; empty for a plain number, and where there is none.
    std::string_view unit() const { return number() ? _quantity->unit : std::string_view(); }

    /// The same raw number of the same quantity, and so the same text. Different readings may have one text too.
    friend bool operator==(const Reading&, const Reading&) = default;

private:
    QuantityRef _quantity;
    Quantity::Raw _raw;
};

/// A quantity of numbers that are computed: `Text` words them.
template <std::string (*Text)(double)>
constexpr Quantity computedQuantity(std::string_view unit)
{
    return {[](Quantity::Raw raw) { return Text(std::bit_cast<double>(raw)); },
            [](Quantity::Raw raw) { return std::bit_cast<double>(raw); }, unit};
}

} // namespace kestrum
