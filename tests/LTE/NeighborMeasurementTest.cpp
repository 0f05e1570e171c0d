#include "LogGenerator/LTE/NeighborCellsList.h"
#include "LogGenerator/LTE/NeighborMeasurementMisc.h"

#include "sections/DecodedSection.h"
#include "sections/FieldCase.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::Pair;

TEST(NeighborMeasurementMisc, ShowsWhatTheCellsHaveInCommonInOrder)
{
    const auto display = decoded<NeighborMeasurementMisc>(record(0xB180, 21).u8(13, 2).u16(17, 6300).u16(19, 10));
    EXPECT_EQ(display.text(), R"({"Version": "2", "E-ARFCN": "6300", "Qrxlevmin": "-120 dBm"})");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "Neighbor Measurements")));
}

class NeighborMeasurementField : public testing::TestWithParam<FieldCase> {};

TEST_P(NeighborMeasurementField, IsShownIndependentlyOfOtherFields)
{
    for (const bool amidOnes : {false, true})
        EXPECT_EQ(decoded<NeighborMeasurementMisc>(GetParam().in(record(0xB180, 21), amidOnes)).at(GetParam().key),
                  GetParam().text)
            << "amid " << (amidOnes ? "ones" : "zeros");
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(NeighborMeasurementMisc, NeighborMeasurementField, testing::Values(
    FieldCase{"Version",         13, 1, 0, 7,  255,   "Version",   "255"},
    FieldCase{"Earfcn",          17, 2, 0, 15, 65535, "E-ARFCN",   "65535"},
    FieldCase{"QrxlevminLowest", 19, 2, 0, 5,  0,     "Qrxlevmin", "-140 dBm"},
    FieldCase{"QrxlevminTop",    19, 2, 0, 5,  63,    "Qrxlevmin", "-14 dBm"}),
    [](const auto& each) { return std::string(each.param.name); });
// clang-format on

class NeighborCellField : public testing::TestWithParam<FieldCase> {};

// Offsets count from the cell's first byte. The test reads the second cell.
TEST_P(NeighborCellField, IsShownIndependentlyOfOtherFields)
{
    auto inSecondCell = GetParam();
    inSecondCell.offset += 21 + 20;
    for (const bool amidOnes : {false, true}) {
        const auto two = inSecondCell.in(record(0xB180, 21 + 2 * 20).u16(19, 1u << 6), amidOnes);
        const auto display = decodedList<NeighborCellsList>(two);
        ASSERT_EQ(display.size(), 2u);
        EXPECT_EQ(display.row(1)->at(GetParam().key), GetParam().text) << "amid " << (amidOnes ? "ones" : "zeros");
    }
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(NeighborCellsList, NeighborCellField, testing::Values(
    FieldCase{"CellId",           0, 4, 0, 8,   511,    "Physical Cell ID",    "511"},
    FieldCase{"RssiLowest",       0, 4, 9, 16,  0,      "Measured RSSI",       "-140.00 dBm"},
    FieldCase{"RssiRaw160",       0, 4, 9, 16,  160,    "Measured RSSI",       "-60.00 dBm"},
    FieldCase{"RssiHighest",      0, 4, 9, 16,  255,    "Measured RSSI",       "-12.50 dBm"},
    FieldCase{"RsrpHalfDbSteps",  0, 4, 17, 25, 101,    "Measured RSRP",       "-89.50 dBm"},
    FieldCase{"RsrpHighest",      0, 4, 17, 25, 511,    "Measured RSRP",       "115.50 dBm"},
    FieldCase{"AverageRsrp",      4, 2, 0, 8,   100,    "Average RSRP",        "-90.00 dBm"},
    FieldCase{"AverageRsrpTop",   4, 2, 0, 8,   511,    "Average RSRP",        "115.50 dBm"},
    FieldCase{"RsrqRaw40",        4, 2, 9, 15,  40,     "Measured RSRQ",       "-20.00 dB"},
    FieldCase{"RsrqHighest",      4, 2, 9, 15,  127,    "Measured RSRQ",       "1.75 dB"},
    FieldCase{"AverageRsrq",      6, 2, 0, 6,   73,     "Average RSRQ",        "-11.75 dB"},
    FieldCase{"SrxlevLowest",     6, 2, 7, 13,  0,      "Srxlev",              "-30 dBm"},
    FieldCase{"SrxlevHighest",    6, 2, 7, 13,  127,    "Srxlev",              "97 dBm"},
    FieldCase{"FrequencyOffset",  8, 2, 0, 15,  0xFFFF, "Frequency Offset",    "65535"},
    FieldCase{"FrameOffset0",    12, 4, 0, 10,  2047,   "Ant 0 Frame Offset",  "2047"},
    FieldCase{"SampleOffset0",   12, 4, 11, 29, 524287, "Ant 0 Sample Offset", "524287"},
    FieldCase{"FrameOffset1",    12, 4, 0, 10,  1023,   "Ant 1 Frame Offset",  "1023"},
    FieldCase{"SampleOffset1",   12, 4, 11, 29, 307199, "Ant 1 Sample Offset", "307199"}),
    [](const auto& each) { return std::string(each.param.name); });
// clang-format on

TEST(NeighborCellsList, WithTheCountField0ShowsOneCellFrom21)
{
    const auto display = decodedList<NeighborCellsList>(record(0xB180, 41).u16(21, 77));
    ASSERT_EQ(display.size(), 1u);
    EXPECT_EQ(display.row(0)->at("Physical Cell ID"), "77");
}

TEST(NeighborCellsList, ShowsTheKeysInOrder)
{
    EXPECT_EQ(decodedList<NeighborCellsList>(record(0xB180, 41).u32(33, 5u | 6u << 11)).text(),
              R"([{"Physical Cell ID": "0", "Measured RSSI": "-140.00 dBm", "Measured RSRP": "-140.00 dBm", )"
              R"("Average RSRP": "-140.00 dBm", "Measured RSRQ": "-30.00 dB", "Average RSRQ": "-30.00 dB", )"
              R"("Srxlev": "-30 dBm", "Frequency Offset": "0", "Ant 0 Frame Offset": "5", )"
              R"("Ant 0 Sample Offset": "6", "Ant 1 Frame Offset": "5", "Ant 1 Sample Offset": "6"}])");
}

TEST(NeighborCellsList, ShowsAntenna0AsAntenna1AndIgnoresTheBytesAfterIt)
{
    const auto display = decodedList<NeighborCellsList>(record(0xB180, 41).u32(33, 0x2345'6789).u32(37, 0xFFFF'FFFF));
    EXPECT_EQ(display.row(0)->at("Ant 1 Frame Offset"), display.row(0)->at("Ant 0 Frame Offset"));
    EXPECT_EQ(display.row(0)->at("Ant 1 Sample Offset"), display.row(0)->at("Ant 0 Sample Offset"));
    EXPECT_EQ(display.row(0)->at("Ant 1 Frame Offset"), "1929");
}

TEST(NeighborCellsList, LogsTheCountAndTheMeasurementsOfEachCell)
{
    auto two = record(0xB180, 61).u16(19, 1u << 6);
    // Cell id 77, RSSI -60, RSRP -90, average RSRP -91; RSRQ -10, average RSRQ -11.
    two.u32(21, 77u | 160u << 9 | 100u << 17).u16(25, 98u | 80u << 9).u16(27, 76);
    const auto display = decodedList<NeighborCellsList>(two);
    EXPECT_THAT(display.log().lines,
                ElementsAre(Pair(Priority::Warning, "Neighbor Cells List"),
                            Pair(Priority::Warning, "Number of neighboring cells being reported: 2\n"),
                            Pair(Priority::Warning, "Physical Cell ID: 77\n"),
                            Pair(Priority::Warning, "Measured RSSI: -60.000000\n"),
                            Pair(Priority::Warning, "Measured RSSI: -90.000000\n"),
                            Pair(Priority::Warning, "Measured RSSI: -91.000000\n"),
                            Pair(Priority::Warning, "Measured RSSI: -10.000000\n"),
                            Pair(Priority::Warning, "Measured RSSI: -11.000000\n"),
                            Pair(Priority::Warning, "Physical Cell ID: 0\n"),
                            Pair(Priority::Warning, "Measured RSSI: -140.000000\n"),
                            Pair(Priority::Warning, "Measured RSSI: -140.000000\n"),
                            Pair(Priority::Warning, "Measured RSSI: -140.000000\n"),
                            Pair(Priority::Warning, "Measured RSSI: -30.000000\n"),
                            Pair(Priority::Warning, "Measured RSSI: -30.000000\n")));
}

TEST(NeighborCellsList, ShowsUpTo32Cells)
{
    // The bits above the count are ignored.
    EXPECT_EQ(decodedList<NeighborCellsList>(record(0xB180, 21 + 33 * 20).u16(19, 0xFFFF)).size(), 32u);
}

TEST(NeighborCellsList, OfACutRecordEndsAtTheLastCellWhoseSixteenBytesAreThere)
{
    const auto cells = [](std::size_t length) {
        return decodedList<NeighborCellsList>(record(0xB180, length).u16(19, 31u << 6)).size();
    };
    EXPECT_EQ(cells(21), 0u);
    EXPECT_EQ(cells(21 + 15), 0u);
    EXPECT_EQ(cells(21 + 16), 1u);
    EXPECT_EQ(cells(21 + 20 + 15), 1u);
    EXPECT_EQ(cells(21 + 20 + 16), 2u);
}

} // namespace
} // namespace kestrum
