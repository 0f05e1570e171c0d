#include "LogGenerator/Row.h"

namespace kestrum {

void show(Record record, std::span<const Row> rows, Dictionary& into)
{
    for (const auto& row : rows)
        if (const auto raw = record.read(row.field))
            row.conversion.apply(*raw, [&](std::string_view text) { into.setText(row.key, text); });
}

DictionaryRef shown(Record record, std::span<const Row> rows)
{
    auto dictionary = makeDictionary();
    show(record, rows, *dictionary);
    return dictionary;
}

} // namespace kestrum
