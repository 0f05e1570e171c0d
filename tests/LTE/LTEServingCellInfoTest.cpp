#include "LogGenerator/LTE/LTEServingCellInfo.h"

#include "sections/DecodedSection.h"
#include "sections/FieldCase.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::Pair;

Value servingCell(std::int64_t physicalCellId = 301)
{
    return cell("LTE", "Serving",
                {{"kVoxCell_TAC", 4660},
                 {"kVoxCell_CellId", 27447297},
                 {"kVoxCell_PhysicalCellId", physicalCellId},
                 {"kVoxCell_BandInfo", 3},
                 {"kVoxCell_UARFCN", 1575}});
}

TEST(LTEServingCellInfo, HasItsNameAndItsCodesInOrder)
{
    auto section = decoded<LTEServingCellInfo>();
    EXPECT_EQ(section.section().getSectionName(), "Serving Cell Info");
    EXPECT_EQ(section.section().getLogCodeArray(), (std::vector<LogCode>{0xB0C2, 0xB0C1, 0xFF0001}));
}

TEST(LTEServingCellInfo, Of0xB0C1With21BytesChangesNothingAndLogsTheEntryLineAlone)
{
    const auto display = decoded<LTEServingCellInfo>(record(0xB0C1, 21).u8(20, 2));
    EXPECT_EQ(display.text(), "{}");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "LTE Serving Cell Info")));
}

TEST(LTEServingCellInfo, Of0xB0C1With22BytesShowsTheAntennasAndReportsAnUnknownMessage)
{
    const auto display = decoded<LTEServingCellInfo>(record(0xB0C1, 22).u8(20, 255).u8(19, 9).u8(21, 9));
    EXPECT_EQ(display.text(), R"({"Num Tx Antennas": "255"})");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "LTE Serving Cell Info"),
                                                 Pair(Priority::Error, "Received an unknown log message: 45249")));
}

TEST(LTEServingCellInfo, Of0xB0C2ShowsItsKeysInOrder)
{
    const auto display = decoded<LTEServingCellInfo>(record(0xB0C2, 38)
                                                         .u16(14, 301)
                                                         .u16(16, 1575)
                                                         .u16(18, 19575)
                                                         .u8(20, 100)
                                                         .u8(21, 75)
                                                         .u32(22, 27447297)
                                                         .u16(26, 4660)
                                                         .u32(28, 3)
                                                         .fill(32, 0xFF));
    EXPECT_EQ(display.text(),
              R"({"Physical Cell ID": "301", "Download Frequency": "1575", "Upload Frequency": "19575", )"
              R"("Download Bandwidth": "20 MHz", "Upload Bandwidth": "15 MHz", )"
              R"("Cell Identity": "27447297", "Tracking Area Code": "4660", "Freq Band Indicator": "3"})");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "LTE Serving Cell Info")));
}

TEST(LTEServingCellInfo, Of0xB0C2With37BytesChangesNothingNorRemovesTheUarfcn)
{
    const auto display = decoded<LTEServingCellInfo>(cellMonitor({servingCell()}), record(0xB0C2, 37).u16(14, 9));
    EXPECT_EQ(display.at("Physical Cell ID"), "301");
    EXPECT_EQ(display.at("UARFCN"), "1575");
}

class LTEServingCellField : public testing::TestWithParam<FieldCase> {};

TEST_P(LTEServingCellField, IsShownIndependentlyOfOtherFields)
{
    for (const bool ones : {false, true}) {
        const auto display =
            decoded<LTEServingCellInfo>(GetParam().in(record(0xB0C2, 38).fill(13, ones ? 0xFF : 0), ones));
        EXPECT_EQ(display.at(GetParam().key), GetParam().text) << "amid " << (ones ? "ones" : "zeros");
    }
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(LTEServingCellInfo, LTEServingCellField, testing::Values(
    FieldCase{"PhysicalCellId",   14, 2, 0, 15, 65535,       "Physical Cell ID",    "65535"},
    FieldCase{"DownlinkEarfcn",   16, 2, 0, 15, 65535,       "Download Frequency",  "65535"},
    FieldCase{"UplinkEarfcn",     18, 2, 0, 15, 18000,       "Upload Frequency",    "18000"},
    FieldCase{"CellIdentityTop",  22, 4, 0, 31, 0x7FFFFFFF,  "Cell Identity",       "2147483647"},
    FieldCase{"CellIdentityNegative", 22, 4, 0, 31, 0x80000000, "Cell Identity",    "-2147483648"},
    FieldCase{"CellIdentityAllBits", 22, 4, 0, 31, 0xFFFFFFFF, "Cell Identity",     "-1"},
    FieldCase{"TrackingArea",     26, 2, 0, 15, 65534,       "Tracking Area Code",  "65534"},
    FieldCase{"Band",             28, 4, 0, 31, 20,          "Freq Band Indicator", "20"},
    FieldCase{"BandAllBits",      28, 4, 0, 31, 0xFFFFFFFF,  "Freq Band Indicator", "-1"}),
    [](const auto& each) { return std::string(each.param.name); });
// clang-format on

struct BandwidthCase {
    unsigned resourceBlocks;
    const char* text;

    friend void PrintTo(const BandwidthCase& shown, std::ostream* out) { *out << shown.resourceBlocks; }
};

class LTEBandwidth : public testing::TestWithParam<BandwidthCase> {};

TEST_P(LTEBandwidth, IsShownForBothLinks)
{
    const auto [blocks, text] = GetParam();
    EXPECT_EQ(decoded<LTEServingCellInfo>(record(0xB0C2, 38).u8(20, blocks)).at("Download Bandwidth"), text);
    EXPECT_EQ(decoded<LTEServingCellInfo>(record(0xB0C2, 38).u8(21, blocks)).at("Upload Bandwidth"), text);
}

INSTANTIATE_TEST_SUITE_P(LTEServingCellInfo, LTEBandwidth,
                         testing::Values(BandwidthCase{6, "1.4 MHz"}, BandwidthCase{15, "3 MHz"},
                                         BandwidthCase{25, "5 MHz"}, BandwidthCase{50, "10 MHz"},
                                         BandwidthCase{75, "15 MHz"}, BandwidthCase{100, "20 MHz"},
                                         BandwidthCase{0, "Unknown"}, BandwidthCase{7, "Unknown"},
                                         BandwidthCase{49, "Unknown"}, BandwidthCase{101, "Unknown"},
                                         BandwidthCase{255, "Unknown"}),
                         [](const auto& each) { return std::to_string(each.param.resourceBlocks) + "Blocks"; });

TEST(LTEServingCellInfo, OfACellMonitorRecordShowsTheServingCell)
{
    const auto display = decoded<LTEServingCellInfo>(cellMonitor({servingCell()}));
    EXPECT_EQ(display.text(), R"({"Tracking Area Code": "4660", "Cell Identity": "27447297", )"
                              R"("Physical Cell ID": "301", "Freq Band Indicator": "3", "UARFCN": "1575"})");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "LTE Serving Cell Info")));
}

TEST(LTEServingCellInfo, LosesTheUarfcnTo0xB0C2AndGetsItBackFromTheCellMonitor)
{
    auto display = decoded<LTEServingCellInfo>(cellMonitor({servingCell()}));
    ASSERT_EQ(display.at("UARFCN"), "1575");
    display.receive(record(0xB0C2, 38));
    EXPECT_FALSE(display.contains("UARFCN"));
    display.receive(cellMonitor({servingCell()}));
    EXPECT_EQ(display.at("UARFCN"), "1575");
}

TEST(LTEServingCellInfo, TakesTheSecondCellWhenTheFirstIsANeighbour)
{
    const auto neighbour = cell("LTE", "Neighbor", {{"kVoxCell_PhysicalCellId", 7}});
    EXPECT_EQ(decoded<LTEServingCellInfo>(cellMonitor({neighbour, servingCell(42)})).at("Physical Cell ID"), "42");
}

TEST(LTEServingCellInfo, TakesTheFirstOfTwoServingCells)
{
    EXPECT_EQ(decoded<LTEServingCellInfo>(cellMonitor({servingCell(1), servingCell(2)})).at("Physical Cell ID"), "1");
}

TEST(LTEServingCellInfo, PassesOverWhatIsNoLteServingCell)
{
    auto untyped = makeDictionary({{"kVoxCell_Technology", "kVoxCellTechnology_LTE"}, {"kVoxCell_PhysicalCellId", 1}});
    auto ofNoTechnology = makeDictionary({{"kVoxCell_Type", "kVoxCellType_Serving"}, {"kVoxCell_PhysicalCellId", 2}});
    auto display = decoded<LTEServingCellInfo>(cellMonitor(
        {cell("UMTS", "Serving", {{"kVoxCell_PhysicalCellId", 3}}), untyped, ofNoTechnology, "no cell", 5}));
    EXPECT_EQ(display.text(), "{}");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "LTE Serving Cell Info")));
}

TEST(LTEServingCellInfo, OfNoCellsChangesNothing)
{
    const auto display = decoded<LTEServingCellInfo>(cellMonitor({}));
    EXPECT_EQ(display.text(), "{}");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "LTE Serving Cell Info")));
}

TEST(LTEServingCellInfo, LogsEachNumberThatIsMissingAndKeepsItsKey)
{
    auto display = decoded<LTEServingCellInfo>(cellMonitor({servingCell()}));
    const auto before = display.text();
    display.log().lines.clear();
    display.receive(cellMonitor({cell("LTE", "Serving")}));
    EXPECT_EQ(display.text(), before);
    EXPECT_THAT(display.log().lines,
                ElementsAre(Pair(Priority::Warning, "LTE Serving Cell Info"),
                            Pair(Priority::Error, "Serving Cell Info: Failed to retrieve TAC\n"),
                            Pair(Priority::Error, "Serving Cell Info: Failed to retrieve Cell ID\n"),
                            Pair(Priority::Error, "Serving Cell Info: Failed to retrieve Physical Cell ID\n"),
                            Pair(Priority::Error, "Serving Cell Info: Failed to retrieve Freq Band Indicator\n"),
                            Pair(Priority::Error, "Serving Cell Info: Failed to retrieve UARFCN\n")));
}

TEST(LTEServingCellInfo, TakesTheOtherNumbersWhenOneDoesNotConvert)
{
    const auto display = decoded<LTEServingCellInfo>(cellMonitor({cell("LTE", "Serving",
                                                                       {{"kVoxCell_TAC", "4660"},
                                                                        {"kVoxCell_CellId", std::int64_t{1} << 31},
                                                                        {"kVoxCell_PhysicalCellId", 301.0},
                                                                        {"kVoxCell_BandInfo", true},
                                                                        {"kVoxCell_UARFCN", -1}})}));
    EXPECT_EQ(display.text(), R"({"Physical Cell ID": "301", "UARFCN": "-1"})");
    EXPECT_THAT(display.log().errors(), ElementsAre("Serving Cell Info: Failed to retrieve TAC\n",
                                                    "Serving Cell Info: Failed to retrieve Cell ID\n",
                                                    "Serving Cell Info: Failed to retrieve Freq Band Indicator\n"));
}

TEST(LTEServingCellInfo, LogsACellMonitorRecordThatCannotBeParsed)
{
    for (const auto& bad : {record(0xFF0001, 40), propertyListRecord(0xFF0001, makeDictionary())}) {
        const auto display = decoded<LTEServingCellInfo>(bad);
        EXPECT_EQ(display.text(), "{}");
        EXPECT_THAT(display.log().lines,
                    ElementsAre(Pair(Priority::Warning, "LTE Serving Cell Info"),
                                Pair(Priority::Error, "Cell Info Array data could not be constructed"),
                                Pair(Priority::Error, "Failed to get Cell Array\n")));
    }
}

TEST(LTEServingCellInfo, ReportsAForeignCode)
{
    const auto display = decoded<LTEServingCellInfo>(record(0xB17F, 60).fill(13, 0x55));
    EXPECT_EQ(display.text(), "{}");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "LTE Serving Cell Info"),
                                                 Pair(Priority::Error, "Received an unknown log message: 45439")));
}

TEST(LTEServingCellInfo, IsHarmlessBeforeItHasANode)
{
    DecodedSection<LTEServingCellInfo> display{Value()};
    display.receive(record(0xB0C2, 38)).receive(record(0xB0C1, 22)).receive(cellMonitor({servingCell()}));
    EXPECT_TRUE(display.node().isNull());
    EXPECT_THAT(display.log().errors(), ElementsAre("Received an unknown log message: 45249"));
}

} // namespace
} // namespace kestrum
