#include "C2K/C2KRun.h"

namespace kestrum {
namespace {

RecordBuilder forward(std::uint32_t sequence)
{
    return record(0x1192, 241).u32(13, sequence);
}

RecordBuilder reverse(std::uint32_t sequence)
{
    return record(0x127E, 1750).u32(14, sequence);
}

// Bits of a packet by the index of its forward-link counter; 0 for a counter that counts no packets.
constexpr unsigned kForward[56] = {128,  256,  512, 1024, 0,    128,  256,  512,  1024, 0,    128,  256,  512,  1024,
                                   0,    128,  256, 512,  1024, 0,    128,  256,  512,  1024, 0,    512,  1024, 2048,
                                   0,    128,  256, 512,  1024, 0,    512,  1024, 2048, 0,    1024, 3072, 0,    512,
                                   1024, 2048, 0,   4096, 0,    1024, 3072, 0,    4096, 0,    5120, 0,    5120, 0};
constexpr unsigned kReverse[12] = {128, 256, 512, 768, 1024, 1536, 2048, 3072, 4096, 6144, 8192, 12288};

TEST(DataRates, PublishNothingButTheEmptyTextAtFirst)
{
    C2KRun run;
    run.receive(forward(7).u32(17, 3));
    EXPECT_EQ(run.at("kFLDataRate"), Value(""));
    EXPECT_EQ(run.state.at("FLDataSeqNum"), Value(7));
    EXPECT_EQ(run.state.at("FLDataSent"), Value(3 * 128));
    const auto extra = run.state.at("ExtraInfo").dictionary();
    EXPECT_EQ(extra->at("FLDataSeqNum1"), Value(7));
    EXPECT_EQ(extra->at("FLDataSent1"), Value(3 * 128));
    EXPECT_FALSE(extra->contains("FLDataSeqNum2"));
    EXPECT_FALSE(extra->contains("FLDataSent2"));
}

TEST(DataRates, AreTheBitsOverTheSequenceNumbers)
{
    C2KRun run;
    run.receive(forward(10)).receive(forward(12).u32(17, 16)); // 2048 bits in two slots: 1 kbit each
    EXPECT_EQ(run.at("kFLDataRate"), Value("1.00 kbps"));
    const auto extra = run.state.at("ExtraInfo").dictionary();
    EXPECT_EQ(extra->at("FLDataSeqNum2"), Value(10));
    EXPECT_EQ(extra->at("FLDataSent2"), Value(0));
    EXPECT_EQ(extra->at("FLDataSeqNum1"), Value(12));
    EXPECT_EQ(extra->at("FLDataSent1"), Value(2048));
}

TEST(DataRates, OfBothLinksAreKeptApart)
{
    C2KRun run;
    run.receive(forward(1)).receive(reverse(1)).receive(reverse(2).u32(18, 8));
    EXPECT_EQ(run.at("kFLDataRate"), Value(""));
    EXPECT_EQ(run.at("kRLDataRate"), Value("1.00 kbps"));
    const auto extra = run.state.at("ExtraInfo").dictionary();
    EXPECT_EQ(extra->at("RLDataSeqNum1"), Value(2));
    EXPECT_EQ(extra->at("RLDataSent1"), Value(1024));
    EXPECT_EQ(extra->at("RLDataSeqNum2"), Value(1));
    EXPECT_EQ(extra->at("RLDataSent2"), Value(0));
    EXPECT_EQ(run.state.at("RLDataSeqNum"), Value(2));
    EXPECT_EQ(run.state.at("RLDataSent"), Value(1024));
}

TEST(DataRates, ShowNothingNewForTheSameSequenceNumberButKeepItsBits)
{
    C2KRun run;
    run.receive(forward(10)).receive(forward(11).u32(17, 8));
    run.receive(forward(11).u32(17, 16));
    EXPECT_EQ(run.at("kFLDataRate"), Value("1.00 kbps"));
    EXPECT_EQ(run.state.at("FLDataSent"), Value(2048));
    run.receive(forward(12).u32(17, 48));
    EXPECT_EQ(run.at("kFLDataRate"), Value("4.00 kbps"));
}

TEST(DataRates, ShowNothingNewAcrossTheWrapOfTheSequenceNumber)
{
    C2KRun run;
    run.receive(forward(0xFFFFFFFE)).receive(forward(0xFFFFFFFF).u32(17, 8));
    run.receive(forward(0).u32(17, 80));
    EXPECT_EQ(run.at("kFLDataRate"), Value("1.00 kbps"));
    run.receive(forward(1).u32(17, 96));
    EXPECT_EQ(run.at("kFLDataRate"), Value("2.00 kbps"));
}

TEST(DataRates, ShowNothingNewForAStepBeyond31Bits)
{
    C2KRun run;
    run.receive(forward(0)).receive(forward(0x80000000).u32(17, 8));
    EXPECT_EQ(run.at("kFLDataRate"), Value(""));
    EXPECT_EQ(run.state.at("FLDataSeqNum"), Value(0x80000000u));
}

TEST(DataRates, AreNegativeWhenTheCountersStartedOver)
{
    C2KRun run;
    run.receive(forward(1).u32(17, 8)).receive(forward(2));
    EXPECT_EQ(run.at("kFLDataRate"), Value("-1.00 kbps"));
}

TEST(DataRates, CountEveryForwardPacketByItsSize)
{
    for (std::size_t i = 0; i < std::size(kForward); ++i) {
        C2KRun run;
        run.receive(forward(1).u32(17 + 4 * i, 1));
        EXPECT_EQ(run.state.at("FLDataSent"), Value(kForward[i])) << "counter " << i;
    }
}

TEST(DataRates, CountEveryReversePacketByItsRate)
{
    for (std::size_t rate = 0; rate < std::size(kReverse); ++rate) {
        C2KRun run;
        auto all = reverse(1);
        for (std::size_t group = 0; group < 3; ++group)
            for (std::size_t i = 0; i < 4; ++i)
                all.u32(18 + 24 * rate + 576 * group + 4 * i, 1).u32(306 + 24 * rate + 576 * group + 4 * i, 10);
        run.receive(all);
        EXPECT_EQ(run.state.at("RLDataSent"), Value(kReverse[rate] * (12 + 120))) << "rate " << rate;
    }
}

TEST(DataRates, CountBeyond32Bits)
{
    C2KRun run;
    run.receive(forward(1).u32(17 + 4 * 54, 0xFFFFFFFF).u32(17 + 4 * 52, 0xFFFFFFFF));
    EXPECT_EQ(run.state.at("FLDataSent"), Value(std::uint64_t{0xFFFFFFFF} * 10240));
}

TEST(DataRates, AreUnchangedByAShortRecord)
{
    C2KRun run;
    run.receive(forward(1)).receive(reverse(1));
    run.doubles.log.lines.clear();
    run.receive(record(0x1192, 240).u32(13, 2).u32(17, 8)).receive(record(0x127E, 1749).u32(14, 2).u32(18, 8));
    EXPECT_EQ(run.state.at("FLDataSeqNum"), Value(1));
    EXPECT_EQ(run.state.at("RLDataSeqNum"), Value(1));
    EXPECT_EQ(run.at("kFLDataRate"), Value(""));
    EXPECT_EQ(run.at("kRLDataRate"), Value(""));
    EXPECT_EQ(run.doubles.log.errors(),
              (std::vector<std::string>{"Log code 0x1192 is 240 bytes long but must be at least 241 bytes.",
                                        "Log code 0x127e is 1749 bytes long but must be at least 1750 bytes."}));
}

TEST(DataRates, GoIntoTheHistory)
{
    C2KRun run;
    run.receive(forward(5).u32(17, 1));
    run.generator->generateLogUsingState(run.state);
    run.receive(forward(6).u32(17, 2));
    const auto entry = (*run.state.at("History").array())[0].dictionary();
    EXPECT_EQ(entry->at("ExtraInfo").dictionary()->at("FLDataSeqNum1"), Value(5));
}

} // namespace
} // namespace kestrum
