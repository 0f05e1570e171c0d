#include "LogGenerator/UTRAN/CCTRCHSIRMeasurement.h"
#include "LogGenerator/UTRAN/TRCHBLERMeasurement.h"

#include "sections/DecodedSection.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::Pair;

/// A record with those counts. The bits below the counts are set, because decoders must ignore them.
RecordBuilder channels(unsigned transport, unsigned composite, std::size_t length)
{
    return record(0xD00C, length).u16(14, 0x3Fu | transport << 6 | composite << 12);
}

/// Two transport channels and one CCTrCH, whose entry begins at 289 + 2 * 34.
RecordBuilder twoAndOne()
{
    return channels(2, 1, 357 + 8).bytes(17, {1, 10, 255, 254}).bytes(357, {7, 6, 0, 1, 2, 100, 254, 255});
}

TEST(TRCHBLERMeasurement, ShowsARowForEachTransportChannel)
{
    const auto display = decodedList<TRCHBLERMeasurement>(twoAndOne());
    EXPECT_EQ(display.text(), R"([{"TRCH ID": "1", "TRCH BLER Measurement": "10"}, )"
                              R"({"TRCH ID": "255", "TRCH BLER Measurement": "254"}])");
}

TEST(TRCHBLERMeasurement, LogsItsEntryAtNotice)
{
    EXPECT_THAT(decodedList<TRCHBLERMeasurement>(twoAndOne()).log().lines,
                ElementsAre(Pair(Priority::Notice, "TRCH BLER Measurement")));
}

TEST(CCTRCHSIRMeasurement, OfTwoTransportChannelsReadsTheFirstEntryFrom357)
{
    const auto display = decodedList<CCTRCHSIRMeasurement>(twoAndOne());
    EXPECT_EQ(display.text(), R"([{"CCTRCH ID": "7", "TSNUM": "6", "SIR": ["0", "1", "2", "100", "254", "255"]}])");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "CCTRCH SIR Measurement")));
}

TEST(CCTRCHSIRMeasurement, WithoutTransportChannelsReadsTheFirstEntryFrom289)
{
    const auto display = decodedList<CCTRCHSIRMeasurement>(channels(0, 2, 289 + 16).u8(289, 3).u8(297, 4));
    ASSERT_EQ(display.size(), 2u);
    EXPECT_EQ(display.row(0)->at("CCTRCH ID"), "3");
    EXPECT_EQ(display.row(1)->at("CCTRCH ID"), "4");
}

TEST(ChannelQuality, WithoutChannelsEmptiesBothLists)
{
    EXPECT_EQ(decodedList<TRCHBLERMeasurement>(twoAndOne(), channels(0, 0, 400)).text(), "[]");
    EXPECT_EQ(decodedList<CCTRCHSIRMeasurement>(twoAndOne(), channels(0, 0, 400)).text(), "[]");
}

TEST(ChannelQuality, ShowsAsManyChannelsAsTheCountsCanSay)
{
    const auto full = channels(63, 15, 289 + 34 * 63 + 8 * 15);
    EXPECT_EQ(decodedList<TRCHBLERMeasurement>(full).size(), 63u);
    EXPECT_EQ(decodedList<CCTRCHSIRMeasurement>(full).size(), 15u);
}

TEST(ChannelQuality, OfACutRecordEndsAtTheLastChannelThatFits)
{
    EXPECT_EQ(decodedList<TRCHBLERMeasurement>(channels(63, 15, 17)).size(), 0u);
    EXPECT_EQ(decodedList<TRCHBLERMeasurement>(channels(63, 15, 17 + 5)).size(), 2u);
    EXPECT_EQ(decodedList<CCTRCHSIRMeasurement>(channels(0, 15, 289 + 7)).size(), 0u);
    EXPECT_EQ(decodedList<CCTRCHSIRMeasurement>(channels(0, 15, 289 + 15)).size(), 1u);
    EXPECT_EQ(decodedList<CCTRCHSIRMeasurement>(twoAndOne(), channels(63, 15, 400)).text(), "[]");
}

} // namespace
} // namespace kestrum
