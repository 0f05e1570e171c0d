#pragma once

#include "support/Format.h"
#include "support/Record.h"
#include "support/Value.h"

#include <algorithm>
#include <concepts>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>

namespace kestrum {

/// How a raw field becomes text: formatted, or looked up in a table of names.
class Conversion {
public:
    using Formatted = std::string (*)(std::uint32_t raw);
    using Named = std::string_view (*)(std::uint32_t raw);

    constexpr Conversion(Formatted formatted) : _formatted(formatted) {}
    constexpr Conversion(Named named) : _named(named) {}

    /// Sets the key to the text of the wording's raw value. Nothing is worded anew that stands there already.
    void set(Dictionary& into, std::string_view key, const Wording& wording) const
    {
        into.setWorded(key, wording, [&](Value& value) {
            if (_named != nullptr)
                value.assignText(_named(wording.raw), wording);
            else
                value.assignText(_formatted(wording.raw), wording);
        });
    }

private:
    Formatted _formatted = nullptr;
    Named _named = nullptr;
};

/// One line of a record's layout: where the field stands, the key it is shown under, how it is worded.
struct Row {
    Field field;
    std::string_view key;
    Conversion conversion;
};

/// A line for what is not simply read from a field.
struct Quantity {
    std::string_view key;
    Conversion conversion;
};

/// Sets the line's key to the text of the raw value. Lines are constants: the address of one stands for its key and its
/// conversion both.
template <typename Line>
void show(const Line& line, std::uint32_t raw, Dictionary& into)
{
    if (const Wording wording{&line, raw}; !into.passWorded(wording))
        line.conversion.set(into, line.key, wording);
}

/// Where the last field of a layout ends.
constexpr std::size_t reach(std::span<const Row> rows)
{
    std::size_t end = 0;
    for (const auto& row : rows)
        end = std::max(end, row.field.end());
    return end;
}

/// Sets the key of each row whose field lies inside the record; the other keys keep their values.
void show(Record record, std::span<const Row> rows, Dictionary& into);

/// Elements that follow one another inside a record. Where they overlap or leave gaps, `length`, the bytes that an
/// element's fields take, differs from `stride`.
struct Elements {
    std::size_t first;
    std::size_t stride;
    std::size_t length;

    constexpr Elements(std::size_t from, std::size_t size) : Elements(from, size, size) {}
    constexpr Elements(std::size_t from, std::size_t step, std::size_t size) : first(from), stride(step), length(size)
    {}
};

/// The element of that index; nothing unless all of its bytes lie inside the record.
inline std::optional<Record> elementOf(Record record, Elements elements, std::size_t index)
{
    return record.slice(elements.first + elements.stride * index, elements.length);
}

/// Calls `use` with each element up to the first that does not lie inside the record: a count may promise more than
/// there is.
template <std::invocable<Record> Use>
void forEachElement(Record record, Elements elements, std::size_t count, Use use)
{
    for (std::size_t i = 0; i < count; ++i) {
        const auto element = elementOf(record, elements, i);
        if (!element)
            break;
        use(*element);
    }
}

/// For `Base::replaceArray` and `Base::publish`: what is to stand in a list, a row for each element with the keys that
/// `show` sets.
template <std::invocable<Record, Dictionary&> Show>
auto listed(Record record, Elements elements, std::size_t count, Show showElement)
{
    return [=](Array& list) {
        forEachElement(record, elements, count, [&](Record element) { showElement(element, list.appendRow()); });
    };
}

inline auto listed(Record record, Elements elements, std::size_t count, std::span<const Row> rows)
{
    return listed(record, elements, count, [rows](Record element, Dictionary& row) { show(element, rows, row); });
}

/// The same with a text for each element.
inline auto listed(Record record, Elements elements, std::size_t count, std::string (*text)(Record element))
{
    return [=](Array& list) {
        forEachElement(record, elements, count, [&](Record element) { list.appendText(text(element)); });
    };
}

/// The text at `value` in a table of names that begins at 0; "Unknown" beyond its end.
template <std::size_t Count>
constexpr std::string_view nameIn(const std::string_view (&names)[Count], std::uint32_t value)
{
    return value < Count ? names[value] : std::string_view("Unknown");
}

/// The decimal text of a word, printed as signed 32 bits ("%d").
inline std::string decimal(std::uint32_t raw)
{
    return std::to_string(static_cast<std::int32_t>(raw));
}
/// The decimal text of a signed byte or 16-bit word.
inline std::string decimalSigned8(std::uint32_t raw)
{
    return std::to_string(static_cast<std::int8_t>(raw));
}
inline std::string decimalSigned16(std::uint32_t raw)
{
    return std::to_string(static_cast<std::int16_t>(raw));
}
/// The decimal text of an unsigned word ("%u").
inline std::string decimalUnsigned(std::uint32_t raw)
{
    return std::to_string(raw);
}

} // namespace kestrum
