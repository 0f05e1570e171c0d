#include "LogGenerator/Row.h"

namespace kestrum {

void show(Record record, std::span<const Row> rows, Dictionary& into)
{
    for (const auto& row : rows)
        if (const auto raw = record.read(row.field))
            show(row, *raw, into);
}

} // namespace kestrum
