#include "voxd/scenarios/ScenarioRun.h"

#include <gtest/gtest.h>

#include <charconv>
#include <map>
#include <set>
#include <string>

namespace kestrum {
namespace {

using namespace std::chrono_literals;

class GsmDrive : public testing::Test {
protected:
    std::string at(std::string_view section, std::string_view key) const { return textAt(run.display(), section, key); }
    static int number(const std::string& text)
    {
        int parsed = -1;
        std::from_chars(text.data(), text.data() + text.size(), parsed);
        return parsed;
    }

    ScenarioRun run{"gsm"};
};

TEST_F(GsmDrive, ModemAndCellMonitorNameTheSameNetworkAndArea)
{
    std::set<int> networks;
    int mcc = -1, mnc = -1, area = -1, compared = 0;
    run.decodeFor(5min, [&] {
        const auto shown = [&](const char* key) { return number(at("Serving PLMN", key)); };
        if (run.code == 0x7135) {
            mcc = shown("Mobile Country Code");
            mnc = shown("Mobile Network Code");
            area = shown("Location Area Code");
            networks.insert(mcc);
        } else if (run.code == 0xFF0001) {
            ++compared;
            EXPECT_EQ(shown("Mobile Country Code"), mcc);
            EXPECT_EQ(shown("Mobile Network Code"), mnc);
            EXPECT_EQ(shown("Location Area Code"), area);
        }
    });
    EXPECT_EQ(networks, (std::set<int>{1, 999}));
    EXPECT_GT(compared, 250);
}

TEST_F(GsmDrive, CellsOfBothRadiosServe)
{
    std::set<std::string> gsm, umts;
    run.decodeFor(5min, [&] {
        if (run.code == 0x5134)
            gsm.insert(at("GSM Serving Cell", "Cell ID"));
        else if (run.code == 0x4127)
            umts.insert(at("UMTS RR Info", "Cell ID"));
    });
    EXPECT_GE(gsm.size(), 3u);
    EXPECT_GE(umts.size(), 5u);
}

TEST_F(GsmDrive, CellMonitorAndRadioNameTheSameCell)
{
    std::string gsm, umts;
    int compared = 0;
    run.decodeFor(4min, [&] {
        if (run.code == 0x5134)
            gsm = at("GSM Serving Cell", "Cell ID");
        else if (run.code == 0x4127)
            umts = at("UMTS RR Info", "Cell ID");
        else if (run.code == 0xFF0001) {
            ++compared;
            EXPECT_EQ(at("GSM Serving Cell", "Cell ID"), gsm);
            EXPECT_EQ(at("UMTS RR Info", "Cell ID"), umts);
        }
    });
    EXPECT_GT(compared, 200);
}

TEST_F(GsmDrive, BlockCountersNeverShrink)
{
    std::map<std::string, int> last; // by row and key
    int compared = 0;
    run.decodeFor(4min, [&] {
        if (run.code != 0x4116)
            return;
        const auto rows = nodeNamed("Transport Channels", run.display()).array();
        ASSERT_TRUE(rows);
        for (std::size_t row = 0; row < rows->size(); ++row)
            eachText((*rows)[row], std::to_string(row), [&](const std::string& path, const std::string& text) {
                EXPECT_GE(number(text), last[path]) << path;
                last[path] = number(text);
                ++compared;
            });
    });
    EXPECT_GT(compared, 500);
}

TEST_F(GsmDrive, StatesFollowTheTraffic)
{
    std::set<std::string> rrc, rr, mm, gmm;
    bool contextsCame = false, contextsWent = false;
    run.decodeFor(5min, [&] {
        if (run.code == 0x4125)
            rrc.insert(at("UMTS RR Info", "RRC State"));
        else if (run.code == 0x512C)
            rr.insert(at("GSM RR Info", "RR State"));
        else if (run.code == 0x7131)
            mm.insert(at("Process CS", "MM State"));
        else if (run.code == 0x7130)
            gmm.insert(at("Process PS", "MM State"));
        else if (run.code == 0xFF0002) {
            const auto contexts = nodeNamed("PDP Context Info", run.display()).array();
            contextsCame |= contexts->size() == 2;
            contextsWent |= contextsCame && contexts->size() == 1;
        }
        // Only a channel is ciphered.
        if (run.code == 0x4157) {
            const auto state = at("UMTS RR Info", "RRC State");
            EXPECT_EQ(at("UMTS RR Info", "Ciphering") == "Enabled", state != "Disconnected" && state != "Connecting");
        }
    });
    for (const char* state : {"Disconnected", "Connecting", "CELL_DCH", "CELL_FACH"})
        EXPECT_TRUE(rrc.contains(state)) << state;
    for (const char* state : {"RR_IDLE", "RR_INACTIVE", "RR_CELL_RESELECTION"})
        EXPECT_TRUE(rr.contains(state)) << state;
    for (const char* state : {"MM_IDLE", "MM_CONNECTION_ACTIVE", "MM_LOCATION_UPDATE_INITIATED"})
        EXPECT_TRUE(mm.contains(state)) << state;
    for (const char* state : {"GMM_REGISTERED", "GMM_ROUTING_AREA_UPDATE_INITIATED", "GMM_SERVICE_REQUEST_INITIATED"})
        EXPECT_TRUE(gmm.contains(state)) << state;
    EXPECT_TRUE(contextsWent);
}

TEST(TechnologyDrive, LegsOfHalfAMinuteTakeTurns)
{
    const auto source = makeScenario("drive", {1, ScenarioRun::kStart, ScenarioRun::kLists});
    std::vector<std::string> legs;
    std::vector<std::chrono::microseconds> began;
    for (auto message = source->next(); message->at < 95s; message = source->next())
        if (legs.empty() || legs.back() != source->technology()) {
            legs.emplace_back(source->technology());
            began.push_back(message->at);
        }
    EXPECT_EQ(legs,
              (std::vector<std::string>{"kVoxLogChannelTechnology_Zephra_LTE", "kVoxLogChannelTechnology_Zephra_GSM",
                                        "kVoxLogChannelTechnology_Zephra_LTE", "kVoxLogChannelTechnology_Zephra_GSM"}));
    EXPECT_EQ(began, (std::vector<std::chrono::microseconds>{0s, 30s, 60s, 90s}));
}

} // namespace
} // namespace kestrum
