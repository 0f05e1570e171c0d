#include "LogGenerator/Row.h"

namespace kestrum {

void show(Record record, std::span<const Row> rows, Dictionary& into)
{
    for (const auto& row : rows)
        if (const auto raw = record.read(row.field))
            into.set(row.key, Reading(row.quantity, *raw));
}

} // namespace kestrum
