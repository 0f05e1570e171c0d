#pragma once

#include "LogGenerator/PropertyListRecord.h"
#include "LogGenerator/Row.h"

#include <initializer_list>
#include <span>
#include <string_view>

namespace kestrum {

class SystemLog;

/// A number of 32767 (INT16_MAX) means "not measured" and has an empty text.
constexpr bool isNotMeasured(std::uint32_t raw)
{
    return signed16(raw) == INT16_MAX;
}
constexpr std::string_view emptyText(std::uint32_t)
{
    return {};
}
template <const Quantity& Ordinary>
inline constexpr const Quantity& kWhereMeasured = exceptFor<isNotMeasured, emptyText, Ordinary>;

/// One line of a cell's layout: the number's key in the cell, its key in the display, the line logged at error priority
/// when the cell lacks the number (none for an empty text), and the quantity.
struct CellRow {
    std::string_view number;
    std::string_view key;
    std::string_view whenMissing;
    QuantityRef quantity = decimalSigned32;
};

/// Sets the key of each row whose number the cell has; other keys keep their values. Logs missing numbers. `into` may
/// be null: then it only logs.
void showCell(const Value& cell, std::span<const CellRow> rows, Dictionary* into, SystemLog& log);

/// The first cell with the type and one of the technologies; null when there is none.
Value firstCell(const ArrayRef& cells, std::initializer_list<std::string_view> technologies, std::string_view type);

/// Shows the first serving cell of one of the technologies in a cell-monitor record. Logs when the record holds no
/// array of cells.
void showServingCell(Record data, std::initializer_list<std::string_view> technologies, std::span<const CellRow> rows,
                     Dictionary* into, DecodingRoles& roles);

/// Appends a row for each neighbour cell of the technology in a cell-monitor record, also when numbers are missing. If
/// the record holds no array of cells, logs that and appends nothing.
void appendNeighbors(Array& list, Record data, std::string_view technology, std::span<const CellRow> rows,
                     DecodingRoles& roles);

} // namespace kestrum
