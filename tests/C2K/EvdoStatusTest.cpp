#include "C2K/C2KRun.h"

#include <ostream>

namespace kestrum {
namespace {

RecordBuilder status(unsigned deviceState)
{
    return record(0x1183, 50).u8(36, deviceState);
}

TEST(EvdoStatus, ShowsEveryField)
{
    C2KRun run;
    // Channel 0x7AB: low byte 0xAB, high bits 7; band class 1.
    run.receive(status(5)
                    .u8(13, 0xAB)
                    .u8(14, 0x07 | (1 << 3))
                    .u8(15, 0xB5) // -75
                    .u8(16, 0xAE) // -82
                    .u8(17, 23)
                    .u16(18, 12)
                    .u8(37, 4)
                    .u8(38, 0x56)
                    .u8(39, 0x34)
                    .u8(40, 0x12)
                    .u8(41, 200));
    EXPECT_EQ(run.at("kChannel"), Value("1963"));
    EXPECT_EQ(run.at("k1xEVDODeviceState"), Value("Connected [5]"));
    EXPECT_EQ(run.at("kBandClass"), Value("1.8 to 2.0GHz PCS band [1]"));
    EXPECT_EQ(run.at("kRxAGC0"), Value("-75 dBm"));
    EXPECT_EQ(run.at("kRxAGC1"), Value("-82 dBm"));
    EXPECT_EQ(run.at("kTxAGC"), Value("+23 dBm"));
    EXPECT_EQ(run.at("kServingPNOffset"), Value("12 × 64chips"));
    EXPECT_EQ(run.at("kSessionState"), Value("Open [4]"));
    EXPECT_EQ(run.at("kUATI24"), Value("0x123456"));
    EXPECT_EQ(run.at("kColorCode"), Value("200"));
}

TEST(EvdoStatus, PadsAShortUati)
{
    EXPECT_EQ(C2KRun().receive(status(0).u8(38, 0x0F)).at("kUATI24"), Value("0x00000f"));
}

TEST(EvdoStatus, ShowsNoLinkValuesWhileIdle)
{
    const C2KRun run = std::move(C2KRun().receive(status(3).u8(16, 0xAE).u8(17, 23)));
    EXPECT_EQ(run.at("kRxAGC1"), Value("N/A"));
    EXPECT_EQ(run.at("kTxAGC"), Value("N/A"));
}

TEST(EvdoStatus, ShowsLinkValuesFromAccessOn)
{
    const C2KRun run = std::move(C2KRun().receive(status(4).u8(16, 0xAE).u8(17, 0)));
    EXPECT_EQ(run.at("kRxAGC1"), Value("-82 dBm"));
    EXPECT_EQ(run.at("kTxAGC"), Value("+0 dBm"));
}

TEST(EvdoStatus, ShowsTheMarkerForNoServingPilot)
{
    EXPECT_EQ(C2KRun().receive(status(3).u16(18, 0xFFFF)).at("kServingPNOffset"), Value("Invalid Value"));
    EXPECT_EQ(C2KRun().receive(status(3).u16(18, 0xFFFE)).at("kServingPNOffset"), Value("65534 × 64chips"));
}

struct WrongLength {
    const char* name;
    std::size_t length;
    const char* message;

    friend void PrintTo(const WrongLength& shown, std::ostream* out) { *out << shown.name; }
};

class EvdoStatusLength : public testing::TestWithParam<WrongLength> {};

TEST_P(EvdoStatusLength, ChangesNothingOnScreen)
{
    C2KRun run;
    run.receive(status(5).u8(13, 77));
    const Value before = deepCopy(run.display());
    run.doubles.log.lines.clear();

    run.receive(record(0x1183, GetParam().length).u8(13, 99));

    EXPECT_EQ(run.display(), before);
    EXPECT_EQ(run.doubles.log.errors(), std::vector<std::string>{GetParam().message});
}

INSTANTIATE_TEST_SUITE_P(
    Wrong, EvdoStatusLength,
    testing::Values(WrongLength{"OneByteShort", 49, "Log code 0x1183 is 49 bytes long but should be 50 bytes."},
                    WrongLength{"OneByteLonger", 51, "Log code 0x1183 is 51 bytes long but should be 50 bytes."}),
    [](const auto& each) { return std::string(each.param.name); });

struct Named {
    const char* name;
    unsigned value;
    const char* text;

    friend void PrintTo(const Named& shown, std::ostream* out) { *out << shown.name; }
};

class EvdoDeviceState : public testing::TestWithParam<Named> {};
class EvdoSessionState : public testing::TestWithParam<Named> {};

TEST_P(EvdoDeviceState, IsNamed)
{
    EXPECT_EQ(C2KRun().receive(status(GetParam().value)).at("k1xEVDODeviceState"), Value(GetParam().text));
}

TEST_P(EvdoSessionState, IsNamed)
{
    EXPECT_EQ(C2KRun().receive(status(0).u8(37, GetParam().value)).at("kSessionState"), Value(GetParam().text));
}

INSTANTIATE_TEST_SUITE_P(Names, EvdoDeviceState,
                         testing::Values(Named{"Inactive", 0, "Inactive [0]"},
                                         Named{"Acquisition", 1, "Acquisition [1]"}, Named{"Sync", 2, "Sync [2]"},
                                         Named{"Idle", 3, "Idle [3]"}, Named{"Access", 4, "Access [4]"},
                                         Named{"Connected", 5, "Connected [5]"},
                                         Named{"FirstReserved", 6, "[Reserved 6]"},
                                         Named{"LastReserved", 255, "[Reserved 255]"}),
                         [](const auto& each) { return std::string(each.param.name); });

INSTANTIATE_TEST_SUITE_P(Names, EvdoSessionState,
                         testing::Values(Named{"Closed", 0, "Closed [0]"}, Named{"AmpSetup", 1, "AMP setup [1]"},
                                         Named{"AtInitiated", 2, "AT-initiated neg [2]"},
                                         Named{"Initiated", 3, "Initiated neg [3]"}, Named{"Open", 4, "Open [4]"},
                                         Named{"FirstReserved", 5, "[Reserved 5]"},
                                         Named{"LastReserved", 255, "[Reserved 255]"}),
                         [](const auto& each) { return std::string(each.param.name); });

} // namespace
} // namespace kestrum
