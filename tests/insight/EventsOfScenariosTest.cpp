// The scenarios know their own cell changes: the events must be the same.
#include "insight/Events.h"
#include "voxd/scenarios/ScenarioRun.h"

#include <gtest/gtest.h>

#include <map>
#include <string>
#include <tuple>
#include <vector>

namespace kestrum {
namespace {

using namespace std::chrono_literals;

struct Drive {
    const char* scenario;
    std::uint64_t seed;
    std::chrono::minutes time;

    friend void PrintTo(const Drive& shown, std::ostream* out) { *out << shown.scenario << " " << shown.seed; }
};

/// A cell that began to serve.
struct Change {
    std::chrono::microseconds at;
    ScenarioCell cell;
};

bool isOfCells(const Event& event)
{
    return event.kind == EventKind::ServingCell || event.kind == EventKind::Reselection ||
           event.kind == EventKind::Handover;
}

/// The first number of an event's text, "LTE cell 1712898, PCI 232", "GSM cell 0x2a01, LAC 0x1107".
std::int64_t identityIn(const std::string& text)
{
    return std::stoll(
        text.substr(text.find_first_of("0123456789", text.find(text.starts_with("1x") ? "station" : " "))), nullptr, 0);
}

/// A drive to its end, with the events that were found and those of the scenario.
struct Ride {
    explicit Ride(const Drive& drive) : run(drive.scenario, drive.seed)
    {
        run.decodeFor(drive.time, [this] {
            const auto at = run.message.at;
            for (const auto& cell : run.source->servingCells()) {
                auto& last = serving[cell.radio];
                if (last == cell.identity)
                    continue;
                last = cell.identity;
                truth.push_back({at, cell});
            }
            // A cell that another radio access, or another modem, has replaced begins anew when it serves again.
            std::erase_if(serving, [this](const auto& each) {
                const auto now = run.source->servingCells();
                return std::ranges::find(now, each.first, &ScenarioCell::radio) == now.end();
            });
            finder.look(*run.generator, run.state, codeOfMessage(), ScenarioRun::kStart + at);
        });
    }
    std::optional<LogCode> codeOfMessage() const { return run.code == 0 ? std::nullopt : std::optional(run.code); }

    std::vector<const Event*> found(std::string_view radio) const
    {
        std::vector<const Event*> list;
        for (const auto& event : finder.events())
            if (isOfCells(event) && event.name == radio)
                list.push_back(&event);
        return list;
    }
    std::vector<Change> changes(std::string_view radio) const
    {
        std::vector<Change> list;
        for (const auto& change : truth)
            if (change.cell.radio == radio)
                list.push_back(change);
        return list;
    }

    ScenarioRun run;
    std::map<std::string_view, std::int64_t> serving;
    std::vector<Change> truth;
    EventFinder finder;
};

class EventsOfScenarios : public testing::TestWithParam<Drive> {
protected:
    /// Each drive takes place once: the tests only read its results.
    static Ride& rideOf(const Drive& drive)
    {
        static std::map<std::string, Ride> rides;
        return rides.try_emplace(drive.scenario + std::to_string(drive.seed), drive).first->second;
    }

    Ride& ride = rideOf(GetParam());
};

TEST_P(EventsOfScenarios, AllChangesOfCellAreFoundAndNoneIsInvented)
{
    std::size_t most = 0;
    for (const std::string_view radio : {"LTE", "GSM", "UMTS", "TD-SCDMA", "1x", "EV-DO"}) {
        const auto expected = ride.changes(radio);
        const auto events = ride.found(radio);
        ASSERT_EQ(events.size(), expected.size()) << radio;
        for (std::size_t i = 0; i < events.size(); ++i) {
            EXPECT_EQ(identityIn(events[i]->is), expected[i].cell.identity) << events[i]->is;
            // In the same tick of 10 ms.
            EXPECT_LT(*events[i]->time - (ScenarioRun::kStart + expected[i].at), 10ms);
        }
        most = std::max(most, events.size());
    }
    EXPECT_GE(most, 5u);
}

TEST_P(EventsOfScenarios, CellsAddUpToTheEventsAndToTheTime)
{
    std::map<std::string_view, std::uint64_t> visits;
    std::map<std::string_view, std::chrono::microseconds> times;
    std::chrono::microseconds all{0};
    for (const auto& cell : ride.finder.cells()) {
        visits[cell.radio] += cell.visits;
        times[cell.radio] += cell.time;
        all += cell.time;
        ASSERT_GT(cell.level.count(), 0u) << cell.radio << " " << cell.identity;
        EXPECT_LE(cell.level.least(), cell.level.mean());
        EXPECT_LE(cell.level.mean(), cell.level.greatest());
    }
    for (const auto& [radio, count] : visits)
        EXPECT_EQ(count, ride.changes(radio).size()) << radio;
    const bool hasTwo = visits.contains("1x");
    EXPECT_GT(all, (hasTwo ? 2 : 1) * GetParam().time - 1s);
    EXPECT_LT(all, (hasTwo ? 2 : 1) * GetParam().time + 1s);
    EXPECT_EQ(ride.finder.cells().dropped(), 0u);
}

// An area changes with a cell, and not without one.
TEST_P(EventsOfScenarios, AreasChangeWithCellsOnly)
{
    std::map<std::string_view, std::size_t> areas;
    for (const auto& event : ride.finder.events())
        if (event.kind == EventKind::Registration && event.name.find("area") != event.name.npos)
            ++areas[event.name];
    for (const auto& [name, count] : areas)
        EXPECT_LE(count, ride.truth.size()) << name;
}

// A path of a table that no record writes would never make an event.
TEST_P(EventsOfScenarios, EveryPlaceOfTheTableIsInTheDisplay)
{
    if (GetParam().seed != 1 || std::string_view(GetParam().scenario) == "drive")
        return; // two modems alternate
    const EventTable& table = *eventTableOf(ride.run.generator->technology());
    const auto expectSeen = [&](const Place& place) {
        WatchedPlace watched(place);
        watched.findIn(ride.run.display());
        watched.look();
        EXPECT_NE(watched.text(), "") << place.path;
    };
    for (const auto& cell : table.cells) {
        for (const auto& part : cell.identity)
            expectSeen(part.place);
        for (const auto& level : cell.levels)
            std::ranges::for_each(level.places, expectSeen);
        if (!cell.state.path.empty())
            expectSeen(cell.state);
    }
    for (const auto& value : table.values)
        std::ranges::for_each(value.parts, expectSeen);
}

INSTANTIATE_TEST_SUITE_P(Events, EventsOfScenarios,
                         testing::Values(Drive{"lte", 1, 4min}, Drive{"lte", 2, 4min}, Drive{"gsm", 1, 4min},
                                         Drive{"gsm", 2, 4min}, Drive{"utran", 1, 4min}, Drive{"utran", 2, 4min},
                                         Drive{"cdma", 1, 4min}, Drive{"cdma", 2, 4min}, Drive{"ifx", 1, 20min},
                                         Drive{"ifx", 2, 20min}, Drive{"drive", 1, 4min}, Drive{"drive", 3, 4min}),
                         [](const auto& each) {
                             return std::string(each.param.scenario) + std::to_string(each.param.seed);
                         });

} // namespace
} // namespace kestrum
