#include "C2K/C2KRun.h"

namespace kestrum {
namespace {

RecordBuilder frame(bool bad)
{
    return record(0x119D, 60).u8(14, 1).u8(17, 11).u16(19, 40).u8(41, bad ? 1 : 0);
}

TEST(TrafficFrameErrors, AverageOverTheLastFrames)
{
    C2KRun run;
    run.receive(frame(true));
    EXPECT_EQ(run.at("k1xTrafficFER"), Value("1.56%"));
    run.receive(frame(false));
    EXPECT_EQ(run.at("k1xTrafficFER"), Value("1.54%"));
}

TEST(TrafficFrameErrors, AreZeroAfterAGoodFirstFrame)
{
    EXPECT_EQ(C2KRun().receive(frame(false)).at("k1xTrafficFER"), Value("0.00%"));
}

TEST(TrafficFrameErrors, AreKeptInSinglePrecision)
{
    C2KRun run;
    run.receive(frame(true)).receive(frame(true)).receive(frame(true));
    const float first = 0.015625F;
    const float second = 0.015625F + first * 0.984375F;
    const float third = 0.015625F + second * 0.984375F;
    EXPECT_EQ(run.state.at("TrafficFER").real(), static_cast<double>(third));
}

TEST(TrafficFrameErrors, ApproachOneHundredPercent)
{
    C2KRun run;
    for (int i = 0; i < 1000; ++i)
        run.receive(frame(true));
    EXPECT_EQ(run.at("k1xTrafficFER"), Value("100.00%"));
}

TEST(TrafficFrameErrors, CountAnyFlagButZeroAsBad)
{
    C2KRun run;
    run.receive(record(0x119D, 60).u8(14, 1).u8(17, 11).u16(19, 40).u8(41, 0x80));
    EXPECT_EQ(run.at("k1xTrafficFER"), Value("1.56%"));
}

TEST(TrafficFrameErrors, AreUnchangedByAShortRecord)
{
    C2KRun run;
    run.receive(record(0x119D, 16));
    EXPECT_EQ(run.at("k1xTrafficFER"), Value(""));
    EXPECT_EQ(run.doubles.log.errors(),
              std::vector<std::string>{"Log code 0x119d is 16 bytes long but must be at least 17 bytes."});
}

TEST(TrafficFrameErrors, AreUnchangedWithoutTheSubpacket)
{
    C2KRun run;
    run.doubles.log.lines.clear();
    run.receive(record(0x119D, 60).u8(14, 1).u8(17, 12).u16(19, 40));
    EXPECT_EQ(run.at("k1xTrafficFER"), Value(""));
    EXPECT_EQ(run.doubles.log.count("Log code 0x119d: missing traffic demod subpacket."), 1u);
    EXPECT_TRUE(run.doubles.log.errors().empty());
    EXPECT_FALSE(run.state.contains("TrafficFER"));
}

TEST(TrafficFrameErrors, AreUnchangedWhenTheFlagLiesBeyondTheRecord)
{
    C2KRun run;
    run.receive(record(0x119D, 41).u8(14, 1).u8(17, 11).u16(19, 24));
    EXPECT_EQ(run.at("k1xTrafficFER"), Value(""));
    EXPECT_FALSE(run.state.contains("TrafficFER"));
}

} // namespace
} // namespace kestrum
