#include "C2K/C2KRun.h"

#include <ostream>

namespace kestrum {
namespace {

constexpr std::size_t kState = 17, kRf = 23, kActiveSet = 37;

struct Pilot {
    unsigned pn, energy;
};

/// Subpackets 1, 2, 3 and 4 in order. The pilots' scale gives N = 1, G = 1, K = 1 (2^-1).
struct Status {
    unsigned deviceState = 6;
    unsigned n = 1, gain = 1, k = 1, m = 1; // with m = 0 a pilot's energy would overlap the next one's PN
    unsigned reference = 0;
    std::vector<Pilot> pilots = {};
    bool fingers = true;

    RecordBuilder build() const
    {
        const std::size_t entry = (6 * m + 15) / 4 * 4;
        const std::size_t activeSetSize = 24 + 4 * m + entry * pilots.size() + 2;
        const std::size_t fingersAt = kActiveSet + activeSetSize;
        auto built = record(0x119C, fingersAt + 8)
                         .u8(14, fingers ? 4 : 3)
                         .u8(kState, 1)
                         .u16(kState + 2, 6)
                         .u8(kState + 4, deviceState)
                         .u8(kRf, 2)
                         .u16(kRf + 2, 14)
                         .u8(kActiveSet, 3)
                         .u16(kActiveSet + 2, static_cast<unsigned>(activeSetSize))
                         .u16(kActiveSet + 4, n)
                         .u8(kActiveSet + 6, gain)
                         .u8(kActiveSet + 7, k)
                         .u8(kActiveSet + 8, static_cast<unsigned>(pilots.size()))
                         .u8(kActiveSet + 9, m)
                         .u16(kActiveSet + 10, reference)
                         .u8(fingersAt, 4)
                         .u16(fingersAt + 2, 8);
        for (std::size_t j = 0; j < pilots.size(); ++j)
            built.u16(kActiveSet + 12 + entry * j, pilots[j].pn)
                .u16(kActiveSet + 24 + 4 * m + entry * j, pilots[j].energy);
        return built;
    }
};

TEST(OneXStatus, ShowsBothChainsInTraffic)
{
    C2KRun run;
    run.receive(Status{.deviceState = 8}
                    .build()
                    .u8(kRf + 4, 0)
                    .u8(kRf + 5, 1)
                    .u16(kRf + 6, 384)
                    .u16(kRf + 8, 425)
                    .u8(kRf + 10, 0xE2)      // -30: -10.02 - 63.248
                    .u8(kRf + 11, 10)        // 3.34 - 63.248
                    .u16(kRf + 12, 0xFF38)); // -200: -20.0
    EXPECT_EQ(run.at("k1xDeviceState"), Value("Traffic [8]"));
    EXPECT_EQ(run.at("k1xRx0BandClass"), Value("800 MHz cellular band [0]"));
    EXPECT_EQ(run.at("k1xRx0ChanNum"), Value("384"));
    EXPECT_EQ(run.at("k1xRxAGC0"), Value("-73.27 dBm"));
    EXPECT_EQ(run.at("k1xRx1BandClass"), Value("1.8 to 2.0GHz PCS band [1]"));
    EXPECT_EQ(run.at("k1xRx1ChanNum"), Value("425"));
    EXPECT_EQ(run.at("k1xRxAGC1"), Value("-59.91 dBm"));
    EXPECT_EQ(run.at("k1xTxAGC"), Value("-20.00 dBm"));
}

TEST(OneXStatus, ShowsNoSecondChainAndNoTransmitterWhilePaging)
{
    C2KRun run;
    run.receive(Status{.deviceState = 6}.build().u16(kRf + 8, 425));
    for (const char* identifier : {"k1xRx1BandClass", "k1xRx1ChanNum", "k1xRxAGC1", "k1xTxAGC"})
        EXPECT_EQ(run.at(identifier), Value("N/A")) << identifier;
    EXPECT_EQ(run.at("k1xDeviceState"), Value("Paging [6]"));
}

TEST(OneXStatus, ShowsARawGainOfZeroAsTheScalesOrigin)
{
    EXPECT_EQ(C2KRun().receive(Status{}.build()).at("k1xRxAGC0"), Value("-63.25 dBm"));
}

TEST(OneXStatus, PublishesNothingWithoutTheFingerSubpacket)
{
    C2KRun run;
    const Value before = deepCopy(run.receive(record(0x119C, 16)).display());
    run.doubles.log.lines.clear();
    run.receive(Status{.fingers = false}.build());
    EXPECT_EQ(run.display(), before);
    EXPECT_EQ(run.doubles.log.count("Log code 0x119c: missing subpacket (ss=1,rf=1,ai=1,fi=0)."), 1u);
    EXPECT_EQ(run.doubles.log.texts(Priority::Warning).size(), 1u);
}

TEST(OneXStatus, SaysWhichSubpacketsAreMissing)
{
    C2KRun run;
    run.receive(record(0x119C, 17));
    EXPECT_EQ(run.doubles.log.count("Log code 0x119c: missing subpacket (ss=0,rf=0,ai=0,fi=0)."), 1u);
}

TEST(OneXStatus, ReportsAShortRecord)
{
    C2KRun run;
    run.receive(record(0x119C, 16));
    EXPECT_EQ(run.doubles.log.errors(),
              std::vector<std::string>{"Log code 0x119c is 16 bytes long but must be at least 17 bytes."});
}

TEST(ActiveSetInfo, HoldsOnlyTheMarkerWithoutPilots)
{
    EXPECT_EQ(C2KRun().receive(Status{}.build()).listAt("k1xActiveSetInfo"), R"({"_sorted": "_sorted"})");
}

TEST(ActiveSetInfo, MarksTheReferencePilot)
{
    C2KRun run;
    // 2^-1 * 36 / 9 - 1 = 1; 2^-1 * 198 / 9 - 1 = 10.
    run.receive(Status{.reference = 300, .pilots = {{12, 36}, {300, 198}}}.build());
    EXPECT_EQ(run.listAt("k1xActiveSetInfo"),
              R"({"_sorted": "_sorted", "0;12": "+0.00 dB", "1;300": "(ref pilot) +10.00 dB"})");
}

TEST(ActiveSetInfo, ScalesByNGainAndK)
{
    C2KRun run;
    // 2^3 * 90 / (2 * 9 * 4) - 1/2 = 9.5
    run.receive(Status{.n = 2, .gain = 2, .k = 3, .reference = 1, .pilots = {{7, 90}}}.build());
    EXPECT_EQ(run.listAt("k1xActiveSetInfo"), R"({"_sorted": "_sorted", "0;7": "+9.78 dB"})");
}

TEST(ActiveSetInfo, TakesTheFloorBelowIt)
{
    C2KRun run;
    run.receive(Status{.reference = 1, .pilots = {{7, 0}}}.build());
    EXPECT_EQ(run.listAt("k1xActiveSetInfo"), R"({"_sorted": "_sorted", "0;7": "-50.00 dB"})");
}

struct Extreme {
    const char* name;
    unsigned n, gain, k, energy;
    const char* text;

    friend void PrintTo(const Extreme& shown, std::ostream* out) { *out << shown.name; }
};

class PilotStrength : public testing::TestWithParam<Extreme> {};

TEST_P(PilotStrength, StaysPresentable)
{
    const auto [name, n, gain, k, energy, text] = GetParam();
    C2KRun run;
    run.receive(Status{.n = n, .gain = gain, .k = k, .reference = 1, .pilots = {{7, energy}}}.build());
    EXPECT_EQ(run.at("k1xActiveSetInfo").dictionary()->at("0;7"), Value(text));
}

INSTANTIATE_TEST_SUITE_P(Extremes, PilotStrength,
                         testing::Values(Extreme{"NoCount", 0, 1, 1, 100, "-50.00 dB"},
                                         Extreme{"NoCountAndNoEnergy", 0, 1, 1, 0, "-50.00 dB"},
                                         Extreme{"NoGain", 1, 0, 1, 100, "+inf dB"},
                                         Extreme{"NoGainAndNoEnergy", 1, 0, 1, 0, "-50.00 dB"},
                                         Extreme{"LargestCount", 65535, 1, 1, 65535, "-50.00 dB"},
                                         Extreme{"SmallestScale", 1, 1, 0, 72, "-50.00 dB"},
                                         Extreme{"LargestScale", 1, 1, 255, 9, "+1526.22 dB"}),
                         [](const auto& each) { return std::string(each.param.name); });

TEST(ActiveSetInfo, PlacesPilotsByTheEntryLengthOfM)
{
    // m = 3: entries of (18 + 15) rounded down to 32 bytes, energies 24 + 12 into the subpacket.
    C2KRun run;
    run.receive(Status{.m = 3, .reference = 1, .pilots = {{40, 36}, {41, 198}}}.build());
    EXPECT_EQ(run.listAt("k1xActiveSetInfo"), R"({"_sorted": "_sorted", "0;40": "+0.00 dB", "1;41": "+10.00 dB"})");
}

TEST(ActiveSetInfo, StopsAtTheFirstPilotThatTheRecordDoesNotHold)
{
    auto whole = Status{.reference = 1, .pilots = {{40, 36}, {41, 198}}}.build();
    whole.u8(kActiveSet + 8, 255);
    C2KRun run;
    run.receive(whole);
    EXPECT_EQ(run.at("k1xActiveSetInfo").dictionary()->at("1;41"), Value("+10.00 dB"));
    EXPECT_LT(run.at("k1xActiveSetInfo").dictionary()->size(), 6u);
}

TEST(ActiveSetInfo, WithTheLargestMStopsAtTheRecordsEnd)
{
    C2KRun run;
    run.receive(Status{.reference = 1, .pilots = {{40, 36}}}.build().u8(kActiveSet + 9, 255));
    EXPECT_EQ(run.listAt("k1xActiveSetInfo"), R"({"_sorted": "_sorted"})");
}

TEST(OneXStatus, PublishesNothingWhenAFieldLiesBeyondTheRecord)
{
    // All four subpackets at one place. The last one is in a record that ends before the RF subpacket's last field.
    C2KRun run;
    auto built = record(0x119C, 61)
                     .u8(14, 4)
                     .u8(17, 1)
                     .u16(19, 6)
                     .u8(23, 3)
                     .u16(25, 12)
                     .u8(35, 4)
                     .u16(37, 14)
                     .u8(49, 2)
                     .u16(51, 14); // its fields end at 63
    run.receive(built);
    EXPECT_EQ(run.at("k1xDeviceState"), Value(""));
    EXPECT_EQ(run.at("k1xRx0ChanNum"), Value(""));
}

TEST(TrafficFrameErrors, OfThePastCallAreShownOnceAfterIt)
{
    C2KRun run;
    run.receive(record(0x119D, 60).u8(14, 1).u8(17, 11).u16(19, 40).u8(41, 1));
    run.receive(Status{.deviceState = 8}.build());
    EXPECT_EQ(run.at("k1xTrafficFER"), Value("1.56%"));

    run.receive(Status{.deviceState = 6}.build());
    EXPECT_EQ(run.at("k1xTrafficFER"), Value("1.56% (old)"));
    EXPECT_FALSE(run.state.contains("TrafficFER"));

    run.receive(Status{.deviceState = 6}.build());
    EXPECT_EQ(run.at("k1xTrafficFER"), Value("1.56% (old)"));
}

struct Named {
    const char* name;
    unsigned value;
    const char* text;

    friend void PrintTo(const Named& shown, std::ostream* out) { *out << shown.name; }
};

class OneXDeviceState : public testing::TestWithParam<Named> {};

TEST_P(OneXDeviceState, IsNamed)
{
    EXPECT_EQ(C2KRun().receive(Status{.deviceState = GetParam().value}.build()).at("k1xDeviceState"),
              Value(GetParam().text));
}

INSTANTIATE_TEST_SUITE_P(
    Names, OneXDeviceState,
    testing::Values(Named{"Inactive", 0, "Inactive [0]"}, Named{"DeepSleep", 1, "Deep sleep in start state [1]"},
                    Named{"Initial", 2, "Initial state for CDMA operation [2]"},
                    Named{"Acquisition", 3, "Acquisition [3]"}, Named{"Sync", 4, "Sync [4]"},
                    Named{"Slew", 5, "Slew [5]"}, Named{"Paging", 6, "Paging [6]"},
                    Named{"SlottedSleep", 7, "Slotted mode sleep state [7]"}, Named{"Traffic", 8, "Traffic [8]"},
                    Named{"UnSlew", 9, "UnSlew [9]"}, Named{"Pcg", 10, "Operation in PCG state [10]"},
                    Named{"Powerup", 11, "Powerup state [11]"}, Named{"FirstWithoutName", 12, "[Bad Value 12]"},
                    Named{"LastWithoutName", 255, "[Bad Value 255]"}),
    [](const auto& each) { return std::string(each.param.name); });

} // namespace
} // namespace kestrum
