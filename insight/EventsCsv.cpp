#include "insight/EventsCsv.h"

#include "support/CsvCells.h"

namespace kestrum {

void appendCsv(std::string& to, const Event& event)
{
    constexpr int kMicroseconds = 6;
    appendGuardedRow(to, {event.time ? isoText(*event.time, kMicroseconds) : std::string(), word(event.kind),
                          event.name, event.was, event.is, event.levels});
}

} // namespace kestrum
