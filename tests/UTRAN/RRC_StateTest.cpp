#include "LogGenerator/UTRAN/RRC_State.h"

#include "sections/DecodedSection.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::Pair;

struct ModeCase {
    const char* name;
    unsigned validity, mode;
    const char* text;

    friend void PrintTo(const ModeCase& shown, std::ostream* out) { *out << shown.name; }
};

class RRCMode : public testing::TestWithParam<ModeCase> {};

TEST_P(RRCMode, IsShown)
{
    const auto display = decoded<RRC_State>(record(0xD0E0, 15).u8(13, GetParam().validity).u8(14, GetParam().mode));
    EXPECT_EQ(display.text(), std::string(R"({"State": ")") + GetParam().text + "\"}");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "RRC Info")));
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(RRC_State, RRCMode, testing::Values(
    ModeCase{"Disconnected", 1,   0,   "Disconnected"},
    ModeCase{"Connecting",   1,   1,   "Connecting"},
    ModeCase{"CellFach",     1,   2,   "Cell Fach"},
    ModeCase{"CellDch",      1,   3,   "Cell DCH"},
    ModeCase{"CellPch",      1,   4,   "Cell PCH"},
    ModeCase{"CellUraPch",   1,   5,   "Cell URA PCH"},
    ModeCase{"FirstUnknown", 1,   6,   "Unknown RRC Mode"},
    ModeCase{"LastUnknown",  1,   255, "Unknown RRC Mode"},
    ModeCase{"NotValid",     0,   3,   "Unknown RRC Mode"},
    ModeCase{"OtherMarker",  2,   3,   "Unknown RRC Mode"},
    ModeCase{"AllBitsMarker", 255, 3,  "Unknown RRC Mode"}),
    [](const auto& each) { return std::string(each.param.name); });
// clang-format on

TEST(RRC_State, OfAShortRecordSaysSoAndShowsThatTheModeIsUnknown)
{
    const auto display = decoded<RRC_State>(record(0xD0E0, 15).u8(13, 1).u8(14, 3), record(0xD0E0, 14).u8(13, 1));
    EXPECT_EQ(display.at("State"), "Unknown RRC Mode");
    EXPECT_THAT(display.log().lines,
                ElementsAre(Pair(Priority::Warning, "RRC Info"), Pair(Priority::Warning, "RRC Info"),
                            Pair(Priority::Warning, "LogCode_0xD0E0 is length is 14 expected size 15")));
}

TEST(RRC_State, OfARecordWithoutEvenTheMarkerShowsThatTheModeIsUnknown)
{
    const auto display = decoded<RRC_State>(record(0xD0E0, 13));
    EXPECT_EQ(display.at("State"), "Unknown RRC Mode");
    EXPECT_EQ(display.log().count("LogCode_0xD0E0 is length is 13 expected size 15"), 1u);
}

TEST(RRC_State, IgnoresAForeignCodeWithoutAWord)
{
    auto display = decoded<RRC_State>(record(0xD0E2, 26).u8(13, 1).u8(14, 3));
    EXPECT_EQ(display.text(), "{}");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "RRC Info")));
    EXPECT_THAT(display.doubles().console.debugged, ElementsAre());
}

TEST(RRC_State, TellsTheDebugConsole)
{
    auto display = decoded<RRC_State>(record(0xD0E0, 15).u8(13, 1).u8(14, 3), record(0xD0E0, 15).u8(14, 3));
    EXPECT_THAT(display.doubles().console.debugged,
                ElementsAre(R"(Display Dict = {"State": "Cell DCH"}, rrc mode = 3 Cell DCH)",
                            R"(Display Dict = {"State": "Unknown RRC Mode"}, rrc mode = 255 Unknown RRC Mode)"));
    EXPECT_THAT(display.doubles().console.printed, ElementsAre());
}

class UnwatchedConsole final : public Console {
public:
    void printLine(std::string_view) override { ++lines; }
    void debug(std::string_view) override { ++lines; }
    bool isDebugWatched() const override { return false; }

    int lines = 0;
};

TEST(RRC_State, FormatsNothingForADisabledConsole)
{
    DecodingDoubles doubles;
    UnwatchedConsole console;
    DecodingRoles roles{doubles.log, console, doubles.clock, doubles.bundle, doubles.propertyLists};
    RRC_State section(roles);
    const Value node = makeDictionary();
    section.updateSectionRef(node);
    section.updateWithData(Record(record(0xD0E0, 15).u8(13, 1).bytes()), 0xD0E0);
    EXPECT_EQ(describe(node), R"({"State": "Disconnected"})");
    EXPECT_EQ(console.lines, 0);
}

} // namespace
} // namespace kestrum
