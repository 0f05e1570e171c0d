#include "LogGenerator/LTE/ConnectedModeMeasurementMisc.h"
#include "LogGenerator/LTE/DetectedCells.h"
#include "LogGenerator/LTE/MeasuredNeighborCells.h"

#include "sections/DecodedSection.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::Pair;

/// Two measured cells, then two detected ones.
RecordBuilder fourCells()
{
    return record(0xB179, 29 + 2 * 6 + 2 * 2)
        .u8(27, 2)
        .u8(28, 2)
        .u16(29, 101)
        .u16(31, 200)
        .u16(33, 80)
        .u16(35, 102)
        .u16(37, 201)
        .u16(39, 81)
        .u16(41, 301)
        .u16(43, 302);
}

TEST(ConnectedModeMeasurementMisc, ShowsTheServingCellInOrder)
{
    const auto display = decoded<ConnectedModeMeasurementMisc>(
        record(0xB179, 29).u16(17, 1575).u16(19, 65535).u16(21, 9).u16(23, 201).u16(25, 87));
    EXPECT_EQ(display.text(), R"({"E-ARFCN": "1575", "Serving Physical Cell ID": "65535", "Subframe Number": "9", )"
                              R"("Serving Filtered RSRP": "-89.75 dBm", "Serving Filtered RSRQ": "-9.12 dB"})");
    EXPECT_THAT(display.log().lines,
                ElementsAre(Pair(Priority::Warning, "Connected mode LTE Intra-frequency Measurement")));
}

TEST(ConnectedModeMeasurementMisc, OfRsrpRaw0ShowsMinus140dBm)
{
    EXPECT_EQ(decoded<ConnectedModeMeasurementMisc>(record(0xB179, 29)).at("Serving Filtered RSRP"), "-140.00 dBm");
}

TEST(ConnectedModeMeasurementMisc, OfRsrpRaw400ShowsMinus40dBm)
{
    EXPECT_EQ(decoded<ConnectedModeMeasurementMisc>(record(0xB179, 29).u16(23, 400)).at("Serving Filtered RSRP"),
              "-40.00 dBm");
}

TEST(ConnectedModeMeasurementMisc, OfTheHighestRawRsrpShowsAnAbsurdPowerAllTheSame)
{
    EXPECT_EQ(decoded<ConnectedModeMeasurementMisc>(record(0xB179, 29).u16(23, 65535)).at("Serving Filtered RSRP"),
              "16243.75 dBm");
}

TEST(ConnectedModeMeasurementMisc, OfRsrqRaw0ShowsMinus20dB)
{
    EXPECT_EQ(decoded<ConnectedModeMeasurementMisc>(record(0xB179, 29)).at("Serving Filtered RSRQ"), "-20.00 dB");
}

TEST(MeasuredNeighborCells, ShowsARowForEachCell)
{
    const auto display = decodedList<MeasuredNeighborCells>(fourCells());
    EXPECT_EQ(display.text(),
              R"([{"Physical Cell ID": "101", "Filtered RSRP": "-90.00 dBm", "Filtered RSRQ": "-10.00 dB"}, )"
              R"({"Physical Cell ID": "102", "Filtered RSRP": "-89.75 dBm", "Filtered RSRQ": "-9.88 dB"}])");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "Measured Neighbor Cells")));
}

TEST(DetectedCells, ShowsTheCellsBehindTheMeasuredOnes)
{
    const auto display = decodedList<DetectedCells>(fourCells());
    EXPECT_EQ(display.text(), R"([{"Physical Cell ID": "301"}, {"Physical Cell ID": "302"}])");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "Detected Cells")));
}

TEST(ConnectedModeCells, WithoutMeasuredOnesEmptyThatListAndBeginTheDetectedAt29)
{
    const auto none = record(0xB179, 33).u8(27, 0).u8(28, 2).u16(29, 17).u16(31, 18);
    EXPECT_EQ(decodedList<MeasuredNeighborCells>(fourCells(), none).text(), "[]");
    EXPECT_EQ(decodedList<DetectedCells>(fourCells(), none).text(),
              R"([{"Physical Cell ID": "17"}, {"Physical Cell ID": "18"}])");
}

TEST(ConnectedModeCells, WithoutDetectedOnesEmptyThatList)
{
    EXPECT_EQ(decodedList<DetectedCells>(fourCells(), record(0xB179, 35).u8(27, 1)).text(), "[]");
}

TEST(ConnectedModeCells, ReplaceTheListOfTheRecordBefore)
{
    const auto display = decodedList<MeasuredNeighborCells>(fourCells(), record(0xB179, 35).u8(27, 1).u16(29, 7));
    EXPECT_EQ(display.size(), 1u);
    EXPECT_EQ(display.row(0)->at("Physical Cell ID"), "7");
}

TEST(ConnectedModeCells, MoreThanTheRecordHoldsEndAtTheLastWholeOne)
{
    // Two measured cells and five bytes of a third.
    auto cut = record(0xB179, 29 + 2 * 6 + 5).fill(29, 0x11).u8(27, 255).u8(28, 255);
    EXPECT_EQ(decodedList<MeasuredNeighborCells>(cut).size(), 2u);
    // The detected cells would begin far after the end.
    EXPECT_EQ(decodedList<DetectedCells>(fourCells(), cut).size(), 0u);
    // Two detected cells and one byte of a third.
    EXPECT_EQ(decodedList<DetectedCells>(record(0xB179, 29 + 5).u8(28, 255)).size(), 2u);
}

TEST(ConnectedModeCells, AsManyAsAByteCountsAreShown)
{
    const auto full = record(0xB179, 29 + 255 * 6 + 255 * 2).u8(27, 255).u8(28, 255).u16(29 + 255 * 6 + 254 * 2, 99);
    EXPECT_EQ(decodedList<MeasuredNeighborCells>(full).size(), 255u);
    const auto detected = decodedList<DetectedCells>(full);
    EXPECT_EQ(detected.size(), 255u);
    EXPECT_EQ(detected.row(254)->at("Physical Cell ID"), "99");
}

} // namespace
} // namespace kestrum
