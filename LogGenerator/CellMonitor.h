#pragma once

#include "LogGenerator/PropertyListRecord.h"
#include "LogGenerator/Row.h"

#include <initializer_list>
#include <span>
#include <string_view>

namespace kestrum {

class SystemLog;

/// `Ordinary`, but for the number that a cell has where it was not measured: its text is empty.
template <const Quantity& Ordinary>
inline constexpr Quantity kWhereMeasured{
    [](Quantity::Raw raw) { return signed16(fieldOf(raw)) == INT16_MAX ? std::string() : Ordinary.text(raw); },
    [](Quantity::Raw raw) { return signed16(fieldOf(raw)) == INT16_MAX ? kNotANumber : Ordinary.number(raw); },
    Ordinary.unit};

/// One line of a cell's layout: the number's key in the cell, the key it is shown under, what is logged at error
/// priority when the cell lacks it (nothing for an empty text), what it means.
struct CellRow {
    std::string_view number;
    std::string_view key;
    std::string_view whenMissing;
    QuantityRef quantity = decimalSigned32;
};

/// Sets the key of each row whose number the cell has; the other keys keep their values. Without a dictionary it only
/// logs what is missing.
void showCell(const Value& cell, std::span<const CellRow> rows, Dictionary* into, SystemLog& log);

/// The first cell of that type and of one of the technologies; null when there is none.
Value firstCell(const ArrayRef& cells, std::initializer_list<std::string_view> technologies, std::string_view type);

/// Shows the first serving cell of one of the technologies in a cell-monitor record. Logs when the record holds no
/// array of cells.
void showServingCell(Record data, std::initializer_list<std::string_view> technologies, std::span<const CellRow> rows,
                     Dictionary* into, DecodingRoles& roles);

/// Appends a row for each neighbour cell of the technology in a cell-monitor record, those with missing numbers
/// included. Logs when the record holds no array of cells, and then appends none.
void appendNeighbors(Array& list, Record data, std::string_view technology, std::span<const CellRow> rows,
                     DecodingRoles& roles);

} // namespace kestrum
