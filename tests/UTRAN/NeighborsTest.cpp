#include "LogGenerator/UTRAN/GSMNeighbhorMeasurements.h"
#include "LogGenerator/UTRAN/UTRANNeighbhorMeasurements.h"

#include "sections/DecodedSection.h"
#include "sections/FieldCase.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::Pair;

/// A record of `count` cells whose fields are all 0.
RecordBuilder neighbors(unsigned count)
{
    return record(0xD00A, 168 + 16 * count).u8(16, count << 1);
}

class UTRANNeighborField : public testing::TestWithParam<FieldCase> {};

// Offsets count from the cell's first byte. The test reads the second cell.
TEST_P(UTRANNeighborField, IsShownIndependentlyOfOtherFields)
{
    auto inSecondCell = GetParam();
    inSecondCell.offset += 168 + 16;
    for (const bool amidOnes : {false, true}) {
        const auto display = decodedList<UTRANNeighbhorMeasurements>(inSecondCell.in(neighbors(2), amidOnes));
        ASSERT_EQ(display.size(), 2u);
        EXPECT_EQ(display.row(1)->at(GetParam().key), GetParam().text) << "amid " << (amidOnes ? "ones" : "zeros");
    }
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(UTRANNeighbhorMeasurements, UTRANNeighborField, testing::Values(
    FieldCase{"Uarfcn",      0, 4, 0, 13,  16383, "UARFCN",      "16383"},
    FieldCase{"CellId",      0, 4, 14, 20, 127,   "Cell ID",     "127"},
    FieldCase{"RscpLowest",  0, 4, 21, 28, 0,     "Filter RSCP", "0.000000"},
    FieldCase{"RscpRaw1",    0, 4, 21, 28, 1,     "Filter RSCP", "0.003906"},
    FieldCase{"RscpRaw128",  0, 4, 21, 28, 128,   "Filter RSCP", "0.500000"},
    FieldCase{"RscpHighest", 0, 4, 21, 28, 255,   "Filter RSCP", "0.996094"},
    FieldCase{"ActiveSet",   0, 4, 29, 30, 0,     "Status",      "ASET"},
    FieldCase{"MonitoredSet", 0, 4, 29, 30, 1,    "Status",      "MSET"},
    FieldCase{"DetectedSet", 0, 4, 29, 30, 2,     "Status",      "DSET"},
    FieldCase{"InJdcs",      0, 4, 31, 31, 1,     "inJDCS",      "TRUE"},
    FieldCase{"NotInJdcs",   0, 4, 31, 31, 0,     "inJDCS",      "FALSE"}),
    [](const auto& each) { return std::string(each.param.name); });
// clang-format on

TEST(UTRANNeighbhorMeasurements, ShowsTheKeysInOrder)
{
    const auto display = decodedList<UTRANNeighbhorMeasurements>(neighbors(1));
    EXPECT_EQ(display.text(), R"([{"UARFCN": "0", "Cell ID": "0", "Filter RSCP": "0.000000", "Status": "ASET", )"
                              R"("inJDCS": "FALSE"}])");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "NeighbhorMeasurements List")));
}

TEST(UTRANNeighbhorMeasurements, OfSetBits3HasNoStatus)
{
    EXPECT_EQ(decodedList<UTRANNeighbhorMeasurements>(neighbors(1).u32(168, 3u << 29)).text(),
              R"([{"UARFCN": "0", "Cell ID": "0", "Filter RSCP": "0.000000", "inJDCS": "FALSE"}])");
}

TEST(UTRANNeighbhorMeasurements, OfByte16Equal1ShowsNoCells)
{
    EXPECT_EQ(decodedList<UTRANNeighbhorMeasurements>(neighbors(2), record(0xD00A, 300).u8(16, 1)).text(), "[]");
}

TEST(UTRANNeighbhorMeasurements, OfByte16Equal3ShowsOneCellFrom168)
{
    const auto display = decodedList<UTRANNeighbhorMeasurements>(record(0xD00A, 300).u8(16, 3).u32(168, 10054));
    ASSERT_EQ(display.size(), 1u);
    EXPECT_EQ(display.row(0)->at("UARFCN"), "10054");
}

TEST(UTRANNeighbhorMeasurements, ShowsUpTo127Cells)
{
    EXPECT_EQ(decodedList<UTRANNeighbhorMeasurements>(record(0xD00A, 168 + 16 * 128).u8(16, 255)).size(), 127u);
}

TEST(UTRANNeighbhorMeasurements, OfACutRecordEndsAtTheLastCellWhoseFourBytesAreThere)
{
    const auto cells = [](std::size_t length) {
        return decodedList<UTRANNeighbhorMeasurements>(record(0xD00A, length).u8(16, 255)).size();
    };
    EXPECT_EQ(cells(21), 0u);
    EXPECT_EQ(cells(168 + 3), 0u);
    EXPECT_EQ(cells(168 + 4), 1u);
    EXPECT_EQ(cells(168 + 16 + 3), 1u);
    EXPECT_EQ(cells(168 + 16 + 4), 2u);
}

TEST(GSMNeighbhorMeasurements, IsEmptyAfterAnyRecordOf17BytesOrMore)
{
    for (const std::size_t length : {17u, 18u, 25u, 17u + 8 * 255}) {
        for (const unsigned count : {0u, 1u, 255u}) {
            DecodedSection<GSMNeighbhorMeasurements> display{makeArray({makeDictionary({{"Cell ID", "1"}})})};
            display.receive(record(0xD00E, length).fill(13, 0x5A).u8(16, count));
            EXPECT_EQ(display.text(), "[]") << length << " bytes, " << count << " cells";
        }
    }
}

TEST(GSMNeighbhorMeasurements, Of16BytesChangesNothing)
{
    DecodedSection<GSMNeighbhorMeasurements> display{makeArray({"old"})};
    display.receive(record(0xD00E, 16));
    EXPECT_EQ(display.text(), R"(["old"])");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "GSM Neighbor Cell List")));
}

} // namespace
} // namespace kestrum
