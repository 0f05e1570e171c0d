#include "insight/EventSheet.h"

#include "insight/Events.h"
#include "insight/LocalTime.h"
#include "platform/Clock.h"
#include "support/Format.h"

#include <algorithm>
#include <iterator>
#include <string_view>
#include <utility>
#include <vector>

namespace kestrum {
namespace {

SheetTable eventTable()
{
    return {.columns = {{.heading = "Time", .isIdentity = true},
                        {.heading = "Event"},
                        {.heading = "Was"},
                        {.heading = "Is"},
                        {.heading = "Levels"}}};
}

std::string noteOf(std::size_t shown, std::size_t listed, std::uint64_t dropped)
{
    std::string note;
    if (shown < listed)
        note = formatted("The newest %lu of %lu events are shown. Keep (K) writes them all.", shown, listed);
    if (dropped != 0)
        note += formatted("%s%lu older ones are no longer listed.", note.empty() ? "" : " ", dropped);
    return note;
}

/// "cell 1712898, PCI 232": the title of the event has the radio already, and a phone's screen is narrow.
std::string withoutRadio(std::string_view text, const Event& event)
{
    const bool hasRadio = text.starts_with(event.name) && text.substr(event.name.size()).starts_with(' ');
    return std::string(hasRadio ? text.substr(event.name.size() + 1) : text);
}

} // namespace

EventSheet::EventSheet(const Events& events, const Clock& clock) : _events(events), _clock(clock)
{
    _contents.title = "Events";
    _contents.hint = "Nothing has happened yet. Changes of cells, areas, states and of the connection come here.";
}

bool EventSheet::update(const Shown&)
{
    const auto today = dayText(_clock, _clock.now());
    if (std::exchange(_today, today) != today) {
        _read = 0;
        _contents.parts.clear();
    }
    const auto all = _events.dropped() + _events.size();
    if (all == _read)
        return true;
    if (_contents.parts.empty())
        _contents.parts.push_back({.table = eventTable()});
    auto& part = _contents.parts.front();

    const auto fresh = std::min({all - _read, std::uint64_t{_events.size()}, std::uint64_t{kMostRows}});
    std::vector<SheetRow> rows;
    rows.reserve(std::min(kMostRows, fresh + part.table.rows.size()));
    auto number = all;
    for (auto each = _events.end(); number != all - fresh;) {
        const auto& event = *--each;
        const auto time = event.time ? momentText(_clock, *event.time, _today) : std::string();
        rows.push_back({.identity = std::to_string(--number),
                        .cells = {{time},
                                  {titleOf(event)},
                                  {withoutRadio(event.was, event)},
                                  {withoutRadio(event.is, event)},
                                  {event.levels}}});
    }
    const auto kept = std::min(part.table.rows.size(), kMostRows - rows.size());
    std::move(part.table.rows.begin(), part.table.rows.begin() + static_cast<std::ptrdiff_t>(kept),
              std::back_inserter(rows));
    part.table.rows = std::move(rows);
    part.note = noteOf(part.table.rows.size(), _events.size(), _events.dropped());
    _read = all;
    return true;
}

} // namespace kestrum
