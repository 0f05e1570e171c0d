#include "LogGenerator/UTRAN/UTRANServingCellInfo.h"

#include "sections/DecodedSection.h"
#include "sections/FieldCase.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::Pair;

Value servingCell(std::int64_t cellId)
{
    return cell("UTRAN2", "Serving",
                {{"kVoxCell_LAC", 4660},
                 {"kVoxCell_CellId", cellId},
                 {"kVoxCell_BandInfo", 34},
                 {"kVoxCell_ScramblingCode", 127},
                 {"kVoxCell_UARFCN", 10700}});
}

TEST(UTRANServingCellInfo, HasItsNameAndItsCodesInOrder)
{
    auto section = decoded<UTRANServingCellInfo>();
    EXPECT_EQ(section.section().getSectionName(), "Serving Cell Info");
    EXPECT_EQ(section.section().getLogCodeArray(), (std::vector<LogCode>{0xD0E2, 0xFF0001}));
}

TEST(UTRANServingCellInfo, ShowsItsKeysInOrder)
{
    const auto display = decoded<UTRANServingCellInfo>(
        record(0xD0E2, 26).u8(14, 1).u8(15, 2).u8(16, 0xFF).u16(17, 9700).u16(19, 10700).u32(21, 65537));
    EXPECT_EQ(display.text(), R"({"Cell Access Restrictions": "1", "Cell ID": "65537", "Downlink UARFCN": "10700", )"
                              R"("Uplink UARFCN": "9700", "URA ID": "2", "Allowed Access": "All Calls"})");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "Serving Cell Info")));
}

TEST(UTRANServingCellInfo, Of25BytesChangesNothing)
{
    const auto display = decoded<UTRANServingCellInfo>(record(0xD0E2, 25).fill(13, 0x11));
    EXPECT_EQ(display.text(), "{}");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "Serving Cell Info")));
}

class UTRANServingCellField : public testing::TestWithParam<FieldCase> {};

TEST_P(UTRANServingCellField, IsShownIndependentlyOfOtherFields)
{
    for (const bool ones : {false, true})
        EXPECT_EQ(decoded<UTRANServingCellInfo>(GetParam().in(record(0xD0E2, 26).fill(13, ones ? 0xFF : 0), ones))
                      .at(GetParam().key),
                  GetParam().text)
            << "amid " << (ones ? "ones" : "zeros");
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(UTRANServingCellInfo, UTRANServingCellField, testing::Values(
    FieldCase{"Restrictions",   14, 1, 0, 7,  255,        "Cell Access Restrictions", "255"},
    FieldCase{"UraId",          15, 1, 0, 7,  255,        "URA ID",                   "255"},
    FieldCase{"Uplink",         17, 2, 0, 15, 65535,      "Uplink UARFCN",            "65535"},
    FieldCase{"Downlink",       19, 2, 0, 15, 10700,      "Downlink UARFCN",          "10700"},
    FieldCase{"CellId",         21, 4, 0, 31, 0x7FFFFFFF, "Cell ID",                  "2147483647"},
    FieldCase{"CellIdNegative", 21, 4, 0, 31, 0xFFFFFFFF, "Cell ID",                  "-1"},
    FieldCase{"EmergencyOnly",  25, 1, 0, 0,  1,          "Allowed Access",           "Emergency Calls Only"},
    FieldCase{"AllCalls",       25, 1, 0, 0,  0,          "Allowed Access",           "All Calls"}),
    [](const auto& each) { return std::string(each.param.name); });
// clang-format on

TEST(UTRANServingCellInfo, OfByte25Equal3ShowsEmergencyCallsOnly)
{
    EXPECT_EQ(decoded<UTRANServingCellInfo>(record(0xD0E2, 26).u8(25, 3)).at("Allowed Access"), "Emergency Calls Only");
}

TEST(UTRANServingCellInfo, OfByte25Equal2ShowsAllCalls)
{
    EXPECT_EQ(decoded<UTRANServingCellInfo>(record(0xD0E2, 26).u8(25, 2)).at("Allowed Access"), "All Calls");
}

TEST(UTRANServingCellInfo, ShowsTheOneUarfcnAsUplinkAndAsDownlink)
{
    const auto display = decoded<UTRANServingCellInfo>(cellMonitor({servingCell(9)}));
    EXPECT_EQ(display.text(),
              R"({"Local Area Code": "4660", "Cell ID": "9", "Freq Band Indicator": "34", )"
              R"("Cell Scrambling Code": "127", "Uplink UARFCN": "10700", "Downlink UARFCN": "10700"})");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "Serving Cell Info")));
}

TEST(UTRANServingCellInfo, ShowsTheSecondOfTwoServingCells)
{
    EXPECT_EQ(decoded<UTRANServingCellInfo>(cellMonitor({servingCell(1), servingCell(2)})).at("Cell ID"), "2");
}

TEST(UTRANServingCellInfo, KeepsOfTheFirstServingCellWhatTheSecondLacks)
{
    const auto second = cell("UTRAN2", "Serving", {{"kVoxCell_CellId", 2}});
    const auto display = decoded<UTRANServingCellInfo>(cellMonitor({servingCell(1), second}));
    EXPECT_EQ(display.at("Cell ID"), "2");
    EXPECT_EQ(display.at("Local Area Code"), "4660");
    EXPECT_THAT(display.log().errors(), ElementsAre("Serving Cell Info: Failed to retrieve LAC\n",
                                                    "Serving Cell Info: Failed to retrieve Freq Band Indicator\n",
                                                    "Serving Cell Info: Failed to retrieve Cell Scrambling Code\n",
                                                    "Serving Cell Info: Failed to retrieve UARFCN\n"));
}

TEST(UTRANServingCellInfo, PassesOverWhatIsNoServingCellOfItsTechnology)
{
    auto untyped = makeDictionary({{"kVoxCell_Technology", "kVoxCellTechnology_UTRAN2"}, {"kVoxCell_CellId", 1}});
    const auto display = decoded<UTRANServingCellInfo>(
        cellMonitor({cell("UMTS", "Serving", {{"kVoxCell_CellId", 2}}),
                     cell("UTRAN2", "Neighbor", {{"kVoxCell_CellId", 3}}), untyped, "no cell"}));
    EXPECT_EQ(display.text(), "{}");
    EXPECT_THAT(display.log().errors(), ElementsAre());
}

TEST(UTRANServingCellInfo, OfNoCellsChangesNothing)
{
    const auto display = decoded<UTRANServingCellInfo>(cellMonitor({}));
    EXPECT_EQ(display.text(), "{}");
    EXPECT_THAT(display.log().errors(), ElementsAre());
}

TEST(UTRANServingCellInfo, LogsACellMonitorRecordThatCannotBeParsedOnce)
{
    const auto display = decoded<UTRANServingCellInfo>(record(0xFF0001, 30));
    EXPECT_EQ(display.text(), "{}");
    EXPECT_THAT(display.log().lines,
                ElementsAre(Pair(Priority::Warning, "Serving Cell Info"),
                            Pair(Priority::Error, "Cell Info Array data could not be constructed")));
}

} // namespace
} // namespace kestrum
