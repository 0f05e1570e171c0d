#include "voxd/scenarios/ScenarioRun.h"

#include <gtest/gtest.h>

#include <set>
#include <string>

namespace kestrum {
namespace {

using namespace std::chrono_literals;

TEST(UtranDrive, ModemAndCellMonitorNameTheSameCell)
{
    ScenarioRun run("utran");
    std::string cell, frequency;
    std::set<std::string> areas;
    int compared = 0;
    run.decodeFor(5min, [&] {
        const auto at = [&](const char* key) { return textAt(run.display(), "Serving Cell Info", key); };
        if (run.code == 0xD0E2) {
            cell = at("Cell ID");
            frequency = at("Downlink UARFCN");
            EXPECT_EQ(at("Uplink UARFCN"), frequency);
        } else if (run.code == 0xFF0001) {
            EXPECT_EQ(at("Cell ID"), cell);
            EXPECT_EQ(at("Downlink UARFCN"), frequency);
            areas.insert(at("Local Area Code"));
            ++compared;
        }
    });
    EXPECT_GT(compared, 250);
    areas.erase("");
    EXPECT_GE(areas.size(), 3u);
}

TEST(UtranDrive, TheServingCellLeadsTheNeighborList)
{
    ScenarioRun run("utran");
    int compared = 0;
    bool known = false;
    run.decodeFor(2min, [&] {
        known |= run.code == 0xFF0001;
        if (run.code != 0xD00A || !known)
            return;
        const auto cells = nodeNamed("Neighbor Cell List", run.display()).array();
        ASSERT_FALSE(cells->empty());
        const auto first = (*cells)[0].dictionary();
        EXPECT_EQ(first->at("Cell ID"), Value(textAt(run.display(), "Serving Cell Info", "Cell Scrambling Code")));
        EXPECT_EQ(first->at("Status"), Value("ASET"));
        ++compared;
    });
    EXPECT_GT(compared, 1000);
}

TEST(UtranDrive, LinkQualityIsThereWhileConnected)
{
    ScenarioRun run("utran");
    std::set<std::string> states;
    run.decodeFor(3min, [&] {
        const auto state = textAt(run.display(), "RRC Info", "State");
        if (run.code == 0xD0E0)
            states.insert(state);
        if (run.code == 0xD00C && (state == "Disconnected" || state == "Connecting")) {
            EXPECT_TRUE(nodeNamed("TRCH BLER", run.display()).array()->empty()) << state;
        }
    });
    for (const char* state : {"Disconnected", "Connecting", "Cell DCH"})
        EXPECT_TRUE(states.contains(state)) << state;
}

} // namespace
} // namespace kestrum
