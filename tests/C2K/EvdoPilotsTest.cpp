#include "C2K/C2KRun.h"

namespace kestrum {
namespace {

TEST(ActiveSetPilots, ShowsNoneWithoutPilots)
{
    EXPECT_EQ(C2KRun().receive(record(0x12B6, 25)).at("kActiveSetPilots"), Value("(none)"));
}

TEST(ActiveSetPilots, ShowsFullEnergyAsZeroDecibels)
{
    C2KRun run;
    run.receive(record(0x12B6, 37).u8(15, 1).u16(25, 168).u16(27, 512));
    EXPECT_EQ(run.listAt("kActiveSetPilots"), R"({"_sorted": "_sorted", "0;168": "+0.00 dB"})");
}

TEST(ActiveSetPilots, KeepsTheRecordsOrder)
{
    C2KRun run;
    run.receive(record(0x12B6, 49).u8(15, 2).u16(25, 300).u16(27, 256).u16(37, 12).u16(39, 1024));
    EXPECT_EQ(run.listAt("kActiveSetPilots"), R"({"_sorted": "_sorted", "0;300": "-3.01 dB", "1;12": "+3.01 dB"})");
}

TEST(ActiveSetPilots, ShowsNoEnergyAsMinusInfinity)
{
    C2KRun run;
    run.receive(record(0x12B6, 37).u8(15, 1).u16(25, 4));
    EXPECT_EQ(run.listAt("kActiveSetPilots"), R"({"_sorted": "_sorted", "0;4": "-inf dB"})");
}

TEST(ActiveSetPilots, AcceptsALongerRecord)
{
    EXPECT_EQ(C2KRun().receive(record(0x12B6, 60)).at("kActiveSetPilots"), Value("(none)"));
}

TEST(ActiveSetPilots, ReportsAShortRecord)
{
    C2KRun run;
    run.receive(record(0x12B6, 24));
    EXPECT_EQ(run.at("kActiveSetPilots"), Value(""));
    EXPECT_EQ(run.doubles.log.errors(),
              std::vector<std::string>{"Log code 0x12b6 is 24 bytes long but must be at least 25 bytes."});
}

TEST(ActiveSetPilots, ReportsMorePilotsThanTheRecordHolds)
{
    C2KRun run;
    run.receive(record(0x12B6, 48).u8(15, 2));
    EXPECT_EQ(run.at("kActiveSetPilots"), Value(""));
    EXPECT_EQ(run.doubles.log.errors(),
              std::vector<std::string>{"Log code 0x12b6 is 48 bytes long, but has 2 substructs."});
}

TEST(Fingers, ShowsNoneWhenAllAreUnused)
{
    C2KRun run;
    run.receive(record(0x108A, 51).u8(22, 2).u16(23, 0xFFFF).u16(37, 0xFFFF));
    EXPECT_EQ(run.at("kFingerC2I"), Value("(none)"));
}

TEST(Fingers, ShowsNoneWithoutFingers)
{
    EXPECT_EQ(C2KRun().receive(record(0x108A, 23)).at("kFingerC2I"), Value("(none)"));
}

TEST(Fingers, LeavesOutAnUnusedOneButNotItsIndex)
{
    C2KRun run;
    run.receive(
        record(0x108A, 65).u8(22, 3).u16(23, 40).u16(29, 512).u16(37, 0xFFFF).u16(43, 512).u16(51, 41).u16(57, 5120));
    EXPECT_EQ(run.listAt("kFingerC2I"), R"({"_sorted": "_sorted", "0;40": "+0.00 dB", "2;41": "+10.00 dB"})");
}

TEST(Fingers, ReportsAShortRecord)
{
    C2KRun run;
    run.receive(record(0x108A, 22));
    EXPECT_EQ(run.doubles.log.errors(),
              std::vector<std::string>{"Log code 0x108a is 22 bytes long but must be at least 23 bytes."});
}

TEST(Fingers, ReportsALengthThatIsNotExact)
{
    for (const std::size_t length : {std::size_t{36}, std::size_t{38}}) {
        C2KRun run;
        run.receive(record(0x108A, length).u8(22, 1));
        EXPECT_EQ(run.at("kFingerC2I"), Value(""));
        EXPECT_EQ(run.doubles.log.errors(),
                  std::vector<std::string>{"Log code 0x108a has bad length of " + std::to_string(length) +
                                           " bytes, but has 1 substructs (size=23)."});
    }
}

TEST(Fingers, TakesAsManyAsTheCountCanSay)
{
    C2KRun run;
    auto all = record(0x108A, 23 + 14 * 255).u8(22, 255);
    for (std::size_t i = 0; i < 255; ++i)
        all.u16(23 + 14 * i, static_cast<unsigned>(i)).u16(29 + 14 * i, 512);
    run.receive(all);
    EXPECT_EQ(run.at("kFingerC2I").dictionary()->size(), 256u);
    EXPECT_EQ(run.at("kFingerC2I").dictionary()->at("254;254"), Value("+0.00 dB"));
}

TEST(PilotLists, AreReplacedByTheNextRecord)
{
    C2KRun run;
    run.receive(record(0x12B6, 37).u8(15, 1).u16(25, 168).u16(27, 512));
    run.receive(record(0x12B6, 25));
    EXPECT_EQ(run.at("kActiveSetPilots"), Value("(none)"));
}

} // namespace
} // namespace kestrum
