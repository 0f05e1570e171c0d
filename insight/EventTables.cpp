#include "insight/EventTables.h"

#include <algorithm>

namespace kestrum {

std::string_view word(EventKind kind)
{
    constexpr std::string_view kWords[] = {"technology", "serving cell", "reselection", "handover", "registration",
                                           "RRC state",  "call",         "data",        "silence",  "connection"};
    return kWords[static_cast<std::size_t>(kind)];
}

std::span<const EventTable* const> eventTables()
{
    static constexpr const EventTable* kAll[] = {&kLteEvents, &kGsmEvents, &kUtranEvents, &kCdmaEvents, &kIfxEvents};
    return kAll;
}

const EventTable* eventTableOf(std::string_view technology)
{
    const auto tables = eventTables();
    const auto found = std::ranges::find(tables, technology, &EventTable::technology);
    return found == tables.end() ? nullptr : *found;
}

} // namespace kestrum
