#pragma once

#include <bit>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace kestrum {

/// The meaning of a raw number: its text, and for a measurement its number and unit. Quantities are constants;
/// readings refer to them.
struct Quantity {
    /// A record's field (unsigned, at most 32 bits), or the bits of a double for a computed value.
    using Raw = std::uint64_t;

    std::string (*text)(Raw raw);
    double (*number)(Raw raw) = nullptr; ///< null for names; NaN for a raw value without a number ("Not Present")
    std::string_view unit = {};          ///< as in the text: "dBm", "dB", "kbps", "%"; empty for a plain number
};

/// A reference to a constant quantity. A temporary or a local quantity does not compile: readings outlive it.
class QuantityRef {
public:
    consteval QuantityRef(const Quantity& quantity) : _quantity(&quantity) {}

    const Quantity& operator*() const { return *_quantity; }
    const Quantity* operator->() const { return _quantity; }
    friend bool operator==(QuantityRef, QuantityRef) = default;

private:
    const Quantity* _quantity;
};

/// A raw number and its quantity. The text is made when it is read, so a new record only stores the number.
class Reading {
public:
    Reading(QuantityRef quantity, Quantity::Raw raw) : _quantity(quantity), _raw(raw) {}
    /// `quantity` was made by `computedQuantity`.
    static Reading computed(QuantityRef quantity, double number)
    {
        return {quantity, std::bit_cast<Quantity::Raw>(number)};
    }

    std::string text() const { return _quantity->text(_raw); }
    /// The number in `unit()`; always finite. Nothing for names, "Not Present" and the like.
    std::optional<double> number() const;
    /// The unit of the number; empty for a plain number and when there is no number.
    std::string_view unit() const { return number() ? _quantity->unit : std::string_view(); }

    /// Same quantity and same raw number. Readings that differ may still have the same text.
    friend bool operator==(const Reading&, const Reading&) = default;

private:
    QuantityRef _quantity;
    Quantity::Raw _raw;
};

/// The quantity of a computed number (an average, a rate); `Text` formats the number.
template <std::string (*Text)(double)>
constexpr Quantity computedQuantity(std::string_view unit)
{
    return {[](Quantity::Raw raw) { return Text(std::bit_cast<double>(raw)); },
            [](Quantity::Raw raw) { return std::bit_cast<double>(raw); }, unit};
}

} // namespace kestrum
