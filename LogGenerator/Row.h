#pragma once

#include "LogGenerator/Quantities.h"
#include "support/Record.h"
#include "support/Value.h"

#include <algorithm>
#include <concepts>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string_view>

namespace kestrum {

/// One line of a record's layout: the field, its key in the display, and its quantity.
struct Row {
    Field field;
    std::string_view key;
    QuantityRef quantity;
};

/// The offset behind the last field of a layout.
constexpr std::size_t reach(std::span<const Row> rows)
{
    std::size_t end = 0;
    for (const auto& row : rows)
        end = std::max(end, row.field.end());
    return end;
}

/// Sets the key of each row whose field lies inside the record; the other keys keep their values.
void show(Record record, std::span<const Row> rows, Dictionary& into);

/// Equal elements inside a record. `stride` is the distance between two elements, `length` the bytes of one; they
/// differ when elements overlap or leave gaps.
struct Elements {
    std::size_t first;
    std::size_t stride;
    std::size_t length;

    constexpr Elements(std::size_t from, std::size_t size) : Elements(from, size, size) {}
    constexpr Elements(std::size_t from, std::size_t step, std::size_t size) : first(from), stride(step), length(size)
    {}
};

/// The element with the index; nothing unless all of its bytes lie inside the record.
inline std::optional<Record> elementOf(Record record, Elements elements, std::size_t index)
{
    return record.slice(elements.first + elements.stride * index, elements.length);
}

/// Calls `use` with each element. Ends at the first element that does not lie inside the record: a count may be too
/// large.
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

/// For `Base::replaceArray` and `Base::publish`: appends a row for each element, with the keys that `showElement` sets.
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

/// The same with a reading of one field for each element.
inline auto listed(Record record, Elements elements, std::size_t count, Field field, QuantityRef quantity)
{
    return [=](Array& list) {
        forEachElement(record, elements, count,
                       [&](Record element) { list.append(Reading(quantity, element.read(field).value_or(0))); });
    };
}

} // namespace kestrum
