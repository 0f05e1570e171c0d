#include "LogGenerator/CellMonitor.h"

#include "platform/SystemLog.h"
#include "platform/TelephonyService.h"

#include <algorithm>

namespace kestrum {
namespace {

/// The record's cells. Null, with a log line, when it holds no array of cells.
ArrayRef cellsIn(Record data, DecodingRoles& roles)
{
    auto cells = CellInfoArray(data, roles).cells();
    if (!cells)
        roles.log.write(Priority::Error, "Failed to get Cell Array\n");
    return cells;
}

} // namespace

void showCell(const Value& cell, std::span<const CellRow> rows, Dictionary* into, SystemLog& log)
{
    for (const auto& row : rows) {
        const auto number = cellNumber(cell, row.number);
        if (!number && !row.whenMissing.empty())
            log.write(Priority::Error, row.whenMissing);
        if (number && into != nullptr)
            into->set(row.key, Reading(row.quantity, static_cast<std::uint32_t>(*number)));
    }
}

Value firstCell(const ArrayRef& cells, std::initializer_list<std::string_view> technologies, std::string_view type)
{
    if (!cells)
        return {};
    const auto found = std::ranges::find_if(*cells, [&](const Value& cell) {
        return std::ranges::any_of(technologies,
                                   [&](std::string_view technology) { return isCell(cell, technology, type); });
    });
    return found == cells->end() ? Value() : *found;
}

void showServingCell(Record data, std::initializer_list<std::string_view> technologies, std::span<const CellRow> rows,
                     Dictionary* into, DecodingRoles& roles)
{
    if (const Value cell = firstCell(cellsIn(data, roles), technologies, kVoxCellType_Serving))
        showCell(cell, rows, into, roles.log);
}

void appendNeighbors(Array& list, Record data, std::string_view technology, std::span<const CellRow> rows,
                     DecodingRoles& roles)
{
    const auto cells = cellsIn(data, roles);
    if (!cells)
        return;
    for (const Value& cell : *cells)
        if (isCell(cell, technology, kVoxCellType_Neighbor))
            showCell(cell, rows, &list.appendRow(), roles.log);
}

} // namespace kestrum
