#include "LogGenerator/ZPH_GSM/ActiveSet.h"
#include "LogGenerator/ZPH_GSM/DetectedSet.h"
#include "LogGenerator/ZPH_GSM/GSMSet.h"
#include "LogGenerator/ZPH_GSM/MonitoredSet.h"
#include "LogGenerator/ZPH_GSM/UMTSSet.h"
#include "LogGenerator/ZPH_GSM/VirtualActiveSet.h"
#include "sections/DecodedSection.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

using Lines = std::vector<std::string>;

/// A cell of the searcher: scrambling code, its set (0: active), its three energies.
struct Searched {
    unsigned scramblingCode, set;
    std::uint32_t energies[3];
};

RecordBuilder searcher(int agc, const std::vector<Searched>& cells)
{
    const std::size_t measurements = 16 + 15 * cells.size();
    auto built = record(0x417A, measurements + 44 * cells.size()).fill(16, 0xA5); // unread bytes are not 0
    built.u16(13, agc).u8(15, static_cast<unsigned>(cells.size()));
    for (std::size_t i = 0; i < cells.size(); ++i) {
        built.u16(16 + 15 * i + 7, cells[i].scramblingCode | cells[i].set << 13);
        for (std::size_t j = 0; j < 3; ++j)
            built.u32(measurements + 44 * i + 32 + 4 * j, cells[i].energies[j]);
    }
    return built;
}

TEST(ActiveSet, ShowsTheCellsOfItsOwnMembershipOnly)
{
    EXPECT_EQ(decodedList<ActiveSet>(searcher(0, {{8191, 0, {500000, 1, 1}}, {12, 1, {500000, 1, 1}}})).text(),
              R"([{"Scrambling Code": "8191", "RSCP": "-56 dB", "Energy Per Chip": "-1 dB"}])");
}

TEST(ActiveSet, HasNoCellOfAnyOtherMembership)
{
    for (unsigned set = 1; set < 8; ++set)
        EXPECT_EQ(decodedList<ActiveSet>(searcher(0, {{12, set, {500000, 0, 0}}})).size(), 0u) << "set " << set;
}

TEST(ActiveSet, AddsLevelAndEnergyTruncatingTowardZero)
{
    // 60000 of the full scale 2^19 is -10 dB; (-600 + 512) / 10 is -8.
    EXPECT_EQ(decodedList<ActiveSet>(searcher(-600, {{12, 0, {60000, 0, 0}}})).text(),
              R"([{"Scrambling Code": "12", "RSCP": "-124 dB", "Energy Per Chip": "-10 dB"}])");
}

TEST(ActiveSet, TakesTheFirstEnergyThatIsNotZero)
{
    EXPECT_EQ(decodedList<ActiveSet>(
                  searcher(0, {{1, 0, {60000, 500000, 1}}, {2, 0, {0, 60000, 500000}}, {3, 0, {0, 0, 60000}}}))
                  .text(),
              R"([{"Scrambling Code": "1", "RSCP": "-65 dB", "Energy Per Chip": "-10 dB"}, )"
              R"({"Scrambling Code": "2", "RSCP": "-65 dB", "Energy Per Chip": "-10 dB"}, )"
              R"({"Scrambling Code": "3", "RSCP": "-65 dB", "Energy Per Chip": "-10 dB"}])");
}

TEST(ActiveSet, ShowsACellWithoutAnyEnergyAtZero)
{
    EXPECT_EQ(decodedList<ActiveSet>(searcher(0, {{1, 0, {0, 0, 0}}})).text(),
              R"([{"Scrambling Code": "1", "RSCP": "-55 dB", "Energy Per Chip": "0 dB"}])");
}

struct Level {
    const char* name;
    int agc;
    const char* rscp;

    friend void PrintTo(const Level& shown, std::ostream* out) { *out << shown.name; }
};

class ReceivedLevel : public testing::TestWithParam<Level> {};

TEST_P(ReceivedLevel, IsShownInWholeDb)
{
    // Full energy: 0 dB.
    EXPECT_EQ(decodedList<ActiveSet>(searcher(GetParam().agc, {{1, 0, {524288, 0, 0}}})).row(0)->at("RSCP"),
              GetParam().rscp);
}

INSTANTIATE_TEST_SUITE_P(ActiveSet, ReceivedLevel,
                         testing::Values(Level{"Lowest", -32768, "-3331 dB"}, Level{"Highest", 32767, "3221 dB"},
                                         Level{"AtTheScalesOrigin", -512, "-106 dB"},
                                         Level{"AlmostAStepBelow", -521, "-106 dB"},
                                         Level{"AStepBelow", -522, "-107 dB"},
                                         Level{"AlmostAStepAbove", -503, "-106 dB"},
                                         Level{"AStepAbove", -502, "-105 dB"}),
                         [](const auto& each) { return std::string(each.param.name); });

TEST(ActiveSet, IsEmptyWithoutCells)
{
    EXPECT_EQ(decodedList<ActiveSet>(searcher(0, {{1, 0, {1, 1, 1}}}), searcher(0, {})).text(), "[]");
}

TEST(ActiveSet, StopsAtTheFirstCellWithoutItsWholeMeasurement)
{
    const auto two = searcher(0, {{1, 0, {60000, 0, 0}}, {2, 0, {60000, 0, 0}}});
    auto cut = two;
    EXPECT_EQ(decodedList<ActiveSet>(cut.length(16 + 30 + 88)).size(), 2u);
    EXPECT_EQ(decodedList<ActiveSet>(cut.length(16 + 30 + 87)).size(), 1u);
    EXPECT_EQ(decodedList<ActiveSet>(cut.length(16 + 30 + 43)).size(), 0u);
    auto promised = two;
    EXPECT_EQ(decodedList<ActiveSet>(promised.u8(15, 255)).size(), 0u); // its measurements would begin at 3841
}

TEST(ActiveSet, HoldsTheMostCellsThatARecordCanCount)
{
    EXPECT_EQ(decodedList<ActiveSet>(searcher(0, std::vector<Searched>(255, {7, 0, {60000, 0, 0}}))).size(), 255u);
}

template <typename Section>
class EmptySet : public testing::Test {};
using EmptySets = testing::Types<DetectedSet, MonitoredSet, VirtualActiveSet>;
TYPED_TEST_SUITE(EmptySet, EmptySets);

TYPED_TEST(EmptySet, StaysEmptyWhateverTheMembership)
{
    for (unsigned set = 0; set < 8; ++set)
        EXPECT_EQ(decodedList<TypeParam>(searcher(0, {{1, set, {60000, 0, 0}}})).text(), "[]") << "set " << set;
}

TYPED_TEST(EmptySet, IsEmptiedByARecordAndLeftByAShortOne)
{
    const Value node = makeArray({Value("left over")});
    DecodedSection<TypeParam> section(node, record(0x417A, 15));
    EXPECT_EQ(section.size(), 1u);
    EXPECT_EQ(section.receive(searcher(0, {})).size(), 0u);
}

/// The first entries of a ranking record's list area, which both lists read.
RecordBuilder ranking(unsigned umts, unsigned gsm, std::initializer_list<unsigned> bytes)
{
    return record(0x4005, 15 + bytes.size()).u8(13, umts).u8(14, gsm).bytes(15, bytes);
}

TEST(Ranking, OfOneCellEachIsReadFromTheSameBytes)
{
    const auto both = ranking(1, 1, {0x3E, 0x29, 0x40, 0x01, 0xB0, 0xFE, 0xFF, 0xF6, 0xFB, 0xFF});
    EXPECT_EQ(decodedList<UMTSSet>(both).text(),
              R"([{"Scrambling Code": "320", "RSCP": "-101 dB", "Energy Per Chip": "-5.000000 dB", )"
              R"("Downlink Frequency": "10558", "Ranking Value": "-5", "Rank Cell RSCP": "-2 dB"}])");
    EXPECT_EQ(decodedList<GSMSet>(both).text(),
              R"([{"ARFCN": "10558", "BSIC": "320", "RSSI": "-80 dBm", "Ranking Value": "-2"}])");
}

TEST(Ranking, ShowsTheExtremesOfItsNumbers)
{
    const auto lowest = ranking(1, 1, {0x00, 0x80, 0xFF, 0xFF, 0x80, 0x00, 0x80, 0x80, 0x00, 0x80});
    EXPECT_EQ(decodedList<UMTSSet>(lowest).text(),
              R"([{"Scrambling Code": "65535", "RSCP": "-149 dB", "Energy Per Chip": "-64.000000 dB", )"
              R"("Downlink Frequency": "-32768", "Ranking Value": "-32768", "Rank Cell RSCP": "-32768 dB"}])");
    EXPECT_EQ(decodedList<GSMSet>(lowest).text(),
              R"([{"ARFCN": "32768", "BSIC": "65535", "RSSI": "-128 dBm", "Ranking Value": "-32768"}])");
}

TEST(Ranking, ShowsHalfDbOfEnergyWithSixDecimals)
{
    EXPECT_EQ(decodedList<UMTSSet>(ranking(1, 0, {0, 0, 0, 0, 0, 0, 0, 0xF3, 0, 0})).row(0)->at("Energy Per Chip"),
              "-6.500000 dB");
}

TEST(Ranking, WithoutCellsEmptiesTheLists)
{
    const auto one = ranking(1, 1, {0, 0, 0, 0, 0, 0, 0, 0, 0, 0});
    EXPECT_EQ(decodedList<UMTSSet>(one, ranking(0, 1, {})).text(), "[]");
    EXPECT_EQ(decodedList<GSMSet>(one, ranking(1, 0, {})).text(), "[]");
}

TEST(Ranking, Of14BytesChangesNeitherList)
{
    const auto one = ranking(1, 1, {0, 0, 0, 0, 0, 0, 0, 0, 0, 0});
    EXPECT_EQ(decodedList<UMTSSet>(one, record(0x4005, 14)).size(), 1u);
    EXPECT_EQ(decodedList<GSMSet>(one, record(0x4005, 14)).size(), 1u);
}

TEST(Ranking, StopsAtTheFirstCellThatTheRecordDoesNotHold)
{
    const auto twenty = record(0x4005, 35).u8(13, 255).u8(14, 255);
    EXPECT_EQ(decodedList<UMTSSet>(twenty).size(), 2u);
    EXPECT_EQ(decodedList<GSMSet>(twenty).size(), 2u); // 6 of the third cell's 7 bytes are present
    auto longer = twenty;
    EXPECT_EQ(decodedList<GSMSet>(longer.length(36)).size(), 3u);
}

Value umtsNeighbor(int rscp, int ecNo)
{
    return cell("UMTS", "Neighbor",
                {{"kVoxCell_UARFCN", 10700},
                 {"kVoxCell_ScramblingCode", 320},
                 {"kVoxCell_RSCP", rscp},
                 {"kVoxCell_EcNo", ecNo}});
}

TEST(UMTSSet, OfTheCellMonitorShowsTheUmtsNeighboursAlone)
{
    EXPECT_EQ(decodedList<UMTSSet>(cellMonitor({cell("UMTS", "Serving", {{"kVoxCell_UARFCN", 1}}),
                                                cell("GSM", "Neighbor", {{"kVoxCell_ARFCN", 2}}), umtsNeighbor(-95, -7),
                                                umtsNeighbor(-96, -8)}))
                  .text(),
              R"([{"UARFCN": "10700", "Scrambling Code": "320", "RSCP": "-95 dBm", "Energy Per Chip": "-7 dB"}, )"
              R"({"UARFCN": "10700", "Scrambling Code": "320", "RSCP": "-96 dBm", "Energy Per Chip": "-8 dB"}])");
}

TEST(UMTSSet, OfTheCellMonitorShowsNothingForWhatWasNotMeasured)
{
    EXPECT_EQ(decodedList<UMTSSet>(cellMonitor({umtsNeighbor(32767, 32767)})).text(),
              R"([{"UARFCN": "10700", "Scrambling Code": "320", "RSCP": "", "Energy Per Chip": ""}])");
}

TEST(UMTSSet, OfTheCellMonitorTakesLevelsAs16Bits)
{
    EXPECT_EQ(decodedList<UMTSSet>(cellMonitor({umtsNeighbor(65536 - 95, 65536 + 32767)})).text(),
              R"([{"UARFCN": "10700", "Scrambling Code": "320", "RSCP": "-95 dBm", "Energy Per Chip": ""}])");
}

TEST(UMTSSet, OfTheCellMonitorKeepsRowsThatLackNumbers)
{
    const auto section = decodedList<UMTSSet>(cellMonitor({cell("UMTS", "Neighbor")}));
    EXPECT_EQ(section.text(), "[{}]");
    EXPECT_EQ(section.log().errors(),
              (Lines{"UMTSSet: Failed to retrieve UARFCN\n", "UMTSSet: Failed to retrieve Scrambling Code\n",
                     "UMTSSet: Failed to retrieve RSCP\n", "UMTSSet: Failed to retrieve Energy Per Chip\n"}));
}

TEST(UMTSSet, IsEmptiedByABrokenCellMonitorRecord)
{
    auto section = decodedList<UMTSSet>(cellMonitor({umtsNeighbor(-95, -7)}));
    section.receive(propertyListRecord(0xFF0001, makeDictionary()));
    EXPECT_EQ(section.text(), "[]");
    EXPECT_EQ(section.log().errors(),
              (Lines{"Cell Info Array data could not be constructed", "Failed to get Cell Array\n"}));
}

TEST(UMTSSet, ShowsWhicheverCameLast)
{
    auto section = decodedList<UMTSSet>(cellMonitor({umtsNeighbor(-95, -7)}));
    EXPECT_EQ(section.receive(ranking(1, 0, {0, 0, 0, 0, 0, 0, 0, 0, 0, 0})).row(0)->at("RSCP"), "-21 dB");
    EXPECT_EQ(section.receive(cellMonitor({umtsNeighbor(-95, -7)})).row(0)->at("RSCP"), "-95 dBm");
}

} // namespace
} // namespace kestrum
