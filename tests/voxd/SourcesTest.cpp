#include "harness/Scratch.h"
#include "platform/TelephonyService.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "voxd/ReplaySource.h"
#include "voxd/scenarios/Scenario.h"

#include <gmock/gmock.h>

#include <fstream>
#include <set>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using namespace std::string_literals;
using testing::ElementsAre;
using testing::HasSubstr;

constexpr Date kStart = std::chrono::sys_days(std::chrono::year{2026} / 11 / 16) + std::chrono::hours{6};

std::string little(std::uint64_t value, int bytes)
{
    std::string text;
    for (int i = 0; i < bytes; ++i, value >>= 8)
        text.push_back(static_cast<char>(value & 0xFF));
    return text;
}

// Ticks of 1.25 ms in the upper 48 bits.
std::string stampedRecord(std::uint64_t milliseconds, std::uint16_t code = 0xB0C2)
{
    return "\x01" + little(12, 2) + little(code, 2) + little((1'000'000 + milliseconds * 4 / 5) << 16, 8);
}

std::string tree(const std::string& time)
{
    return "<plist><dict><key>Time</key>" + time + "</dict></plist>";
}

std::string kcap(const std::vector<std::string>& messages)
{
    std::string bytes;
    for (const auto& each : messages)
        bytes += little(each.size(), 4) + each;
    return bytes;
}

class ReplaySourceTest : public testing::Test {
protected:
    std::string file(const std::string& bytes, const std::string& name = "a.kcap")
    {
        const auto path = directory / name;
        std::ofstream(path, std::ios::binary) << bytes;
        return path;
    }
    std::string whatIsWrong(const std::string& path)
    {
        try {
            ReplaySource(path, false, lists);
        } catch (const std::runtime_error& error) {
            return error.what();
        }
        return "nothing";
    }
    static std::vector<std::chrono::microseconds> times(ReplaySource& source, std::size_t most = 100)
    {
        std::vector<std::chrono::microseconds> found;
        while (found.size() < most)
            if (const auto message = source.next())
                found.push_back(message->at);
            else
                break;
        return found;
    }

    ScratchDirectory directory;
    PropertyListCodec lists;
};

TEST_F(ReplaySourceTest, GivesMessagesAsTheyTravelled)
{
    const auto first = stampedRecord(0), second = "\x81\x07" + stampedRecord(5);
    ReplaySource source(file(kcap({first, second})), false, lists);
    EXPECT_EQ(source.technology(), kVoxLogChannelTechnology_Zephra_LTE);
    EXPECT_EQ(textOf(source.next()->bytes), first);
    EXPECT_EQ(textOf(source.next()->bytes), second);
    EXPECT_FALSE(source.next());
    EXPECT_FALSE(source.next());
    EXPECT_EQ(source.fault(), "");
}

TEST_F(ReplaySourceTest, KeepsTheRhythmOfTheTimeStamps)
{
    ReplaySource source(file(kcap({stampedRecord(0), stampedRecord(250), stampedRecord(1000)})), false, lists);
    EXPECT_THAT(times(source), ElementsAre(0ms, 250ms, 1000ms));
}

TEST_F(ReplaySourceTest, TakesAClockThatWasSetForNoGap)
{
    ReplaySource source(
        file(kcap({stampedRecord(5000), stampedRecord(1000), stampedRecord(1500), stampedRecord(90'000'000)})), false,
        lists);
    EXPECT_THAT(times(source), ElementsAre(0ms, 0ms, 500ms, 500ms));
}

TEST_F(ReplaySourceTest, SpacesMessagesWithoutTimeStampsByHalfASecond)
{
    ReplaySource source(file(kcap({"<plist/>", "<plist/>", "<plist/>"})), false, lists);
    EXPECT_EQ(source.technology(), kVoxLogChannelTechnology_IFX);
    EXPECT_THAT(times(source), ElementsAre(0ms, 500ms, 1000ms));
}

TEST_F(ReplaySourceTest, KeepsTheRhythmOfTheTimesInTrees)
{
    ReplaySource source(
        file(kcap({tree("<string>2026-11-16T06:05:42Z</string>"), tree("<string>2026-11-16T06:05:42.250Z</string>"),
                   tree("<string>2026-11-16 06:05:45 +0000</string>"), stampedRecord(0)})),
        false, lists);
    EXPECT_THAT(times(source), ElementsAre(0ms, 250ms, 3000ms, 3000ms));
}

TEST_F(ReplaySourceTest, TakesAClockInTreesThatWasSetForNoGap)
{
    ReplaySource source(
        file(kcap({tree("<string>2026-11-16T06:05:42Z</string>"), tree("<string>2026-11-16T06:05:40Z</string>"),
                   tree("<string>2026-11-16T06:05:41Z</string>"), tree("<string>2099-12-31T23:59:59Z</string>")})),
        false, lists);
    EXPECT_THAT(times(source), ElementsAre(0ms, 0ms, 1000ms, 1000ms));
}

TEST_F(ReplaySourceTest, SpacesTreesWithoutAUsableTimeByHalfASecond)
{
    const auto timed = tree("<string>2026-11-16T06:05:42Z</string>");
    for (const auto& bad :
         {tree("<string>yesterday</string>"), tree("<string></string>"), tree("<integer>1794809142</integer>"),
          tree("<date>2026-11-16T06:05:43Z</date>"), tree("<string>9999-12-31T23:59:59Z</string>"),
          tree("<array><string>1</string><string>2026-11-16T06:05:43Z</string></array>"),
          tree("<dict><key>Time</key><string>2026-11-16T06:05:43Z</string></dict>"),
          "<plist><string>2026</string></plist>"s, "<plist><dict>"s, "<"s}) {
        ReplaySource source(file(kcap({timed, bad, timed})), false, lists);
        EXPECT_THAT(times(source), ElementsAre(0ms, 500ms, 500ms)) << bad;
    }
}

// Twelve hundred trees, two a second.
TEST_F(ReplaySourceTest, ReplaysTenMinutesOfTreesInTenMinutes)
{
    const auto scenario = makeScenario("ifx", {7, kStart, lists});
    std::string capture;
    for (int i = 0; i < 1200; ++i) {
        const auto message = scenario->next();
        // Two trees come together now and then, as from a modem that reports at its own pace.
        capture += kcap({std::string(textOf(message->bytes))});
        if (i % 100 == 0)
            capture += kcap({std::string(textOf(message->bytes))});
    }
    ReplaySource source(file(capture), false, lists);
    const auto all = times(source, 2000);
    EXPECT_EQ(all.size(), 1212u);
    EXPECT_NEAR(std::chrono::duration<double>(all.back()).count(), 600, 2);
}

TEST_F(ReplaySourceTest, LoopsWithTimesThatGoOn)
{
    ReplaySource source(file(kcap({stampedRecord(0), stampedRecord(200)})), true, lists);
    EXPECT_THAT(times(source, 5), ElementsAre(0ms, 200ms, 700ms, 900ms, 1400ms));
}

TEST_F(ReplaySourceTest, FindsTheTechnologyInALaterMessage)
{
    const auto monitor = "\xFF"s + little(12, 2) + little(1, 2) + "........";
    ReplaySource source(file(kcap({monitor, stampedRecord(0, 0x417A)})), false, lists);
    EXPECT_EQ(source.technology(), kVoxLogChannelTechnology_Zephra_GSM);
    EXPECT_EQ(textOf(source.next()->bytes), monitor);
}

TEST_F(ReplaySourceTest, ChangesItsTechnologyWithTheMessages)
{
    ReplaySource source(file(kcap({stampedRecord(0), stampedRecord(1, 0x417A)})), false, lists);
    EXPECT_EQ(source.technology(), kVoxLogChannelTechnology_Zephra_LTE);
    source.next();
    EXPECT_EQ(source.technology(), kVoxLogChannelTechnology_Zephra_LTE);
    source.next();
    EXPECT_EQ(source.technology(), kVoxLogChannelTechnology_Zephra_GSM);
}

TEST_F(ReplaySourceTest, ReadsDlf)
{
    ReplaySource source(file(stampedRecord(0).substr(1) + stampedRecord(100).substr(1), "a.dlf"), false, lists);
    EXPECT_EQ(textOf(source.next()->bytes), stampedRecord(0));
    const auto second = source.next();
    EXPECT_EQ(textOf(second->bytes), stampedRecord(100));
    EXPECT_EQ(second->at, 100ms);
}

TEST_F(ReplaySourceTest, EndsAtDamageAndReportsItsPlace)
{
    const auto path = file(kcap({stampedRecord(0)}) + "\xFF\xFF\xFF\xFF");
    ReplaySource source(path, true, lists);
    EXPECT_TRUE(source.next());
    EXPECT_FALSE(source.next()) << "no loop over damage";
    EXPECT_EQ(source.fault(),
              path + ": at offset 17: a message of 4294967295 bytes, longer than the limit of 16777216");
}

TEST_F(ReplaySourceTest, RefusesWhatCannotBeReplayed)
{
    EXPECT_THAT(whatIsWrong(directory / "none.kcap"), HasSubstr("none.kcap: cannot be read"));
    std::filesystem::create_directory(directory / "folder.kcap");
    EXPECT_THAT(whatIsWrong(directory / "folder.kcap"), HasSubstr("cannot be read"));
    EXPECT_THAT(whatIsWrong(file("", "a.txt")), HasSubstr("neither .kcap nor .dlf"));
    EXPECT_THAT(whatIsWrong(file("")), HasSubstr("contains no message"));
    EXPECT_THAT(whatIsWrong(file(kcap({"noise"}))), HasSubstr("its messages do not show the technology"));
    EXPECT_THAT(whatIsWrong(file("\x10\0\0\0short"s)),
                HasSubstr("at offset 0: the last message is cut off (11 bytes missing)"));
}

PropertyListCodec kLists;

class AnyScenario : public testing::TestWithParam<Scenario> {};

TEST_P(AnyScenario, IsTheSameForTheSameSeedAndAnotherForAnother)
{
    const auto one = makeScenario(GetParam().name, {7, kStart, kLists}),
               same = makeScenario(GetParam().name, {7, kStart, kLists}),
               other = makeScenario(GetParam().name, {8, kStart, kLists});
    ASSERT_TRUE(one && same && other);
    bool differs = false;
    for (int i = 0; i < 500; ++i) {
        const auto message = one->next(), again = same->next(), elsewhere = other->next();
        ASSERT_TRUE(message && again && elsewhere);
        EXPECT_EQ(message->at, again->at);
        ASSERT_EQ(message->bytes, again->bytes) << "message " << i;
        differs |= message->bytes != elsewhere->bytes;
    }
    EXPECT_TRUE(differs);
}

TEST_P(AnyScenario, GoesOnWithTimesThatNeverFallAndTwoMessagesASecondOrMore)
{
    const auto source = makeScenario(GetParam().name, {1, kStart, kLists});
    EXPECT_EQ(source->technology(), GetParam().technology);
    std::chrono::microseconds last{0};
    for (int i = 0; i < 2000; ++i) {
        const auto message = source->next();
        ASSERT_TRUE(message);
        ASSERT_GE(message->at, last);
        ASSERT_FALSE(message->bytes.empty());
        last = message->at;
    }
    EXPECT_GT(last, 1s);
    EXPECT_LE(last, 1000s);
}

INSTANTIATE_TEST_SUITE_P(Scenarios, AnyScenario, testing::ValuesIn(scenarios().begin(), scenarios().end()),
                         [](const auto& each) { return std::string(each.param.name); });

TEST(Scenarios, HaveOneMakerPerName)
{
    std::set<std::string_view> names;
    for (const auto& each : scenarios())
        EXPECT_TRUE(names.insert(each.name).second) << each.name;
    EXPECT_TRUE(names.contains("ifx"));
    EXPECT_FALSE(makeScenario("no such drive", {1, kStart, kLists}));
}

/// The values that an hour's drive has shown.
class IfxDrive : public testing::Test {
protected:
    static void visit(const Value& value, const std::string& path)
    {
        if (const auto dictionary = value.dictionary()) {
            wrappers += dictionary->size() == 1;
            for (const auto& [key, child] : *dictionary)
                visit(child, path + "/" + key);
        } else if (const auto array = value.array()) {
            ASSERT_FALSE(array->empty()) << path << " has nothing for the display to leave out";
            EXPECT_EQ((*array)[0], Value(std::to_string(array->size() - 1))) << path;
            for (std::size_t i = 1; i < array->size(); ++i)
                visit((*array)[i], path + "[]");
        } else {
            ASSERT_EQ(value.kind(), Value::Kind::String) << path;
            seen[path].insert(*value.text());
        }
    }
    static void SetUpTestSuite()
    {
        const auto source = makeScenario("ifx", {3, kStart, kLists});
        for (int i = 0; i < 7200; ++i) {
            const auto message = source->next();
            const auto tree = kLists.parse(message->bytes);
            ASSERT_TRUE(tree.dictionary()) << "message " << i;
            visit(tree, "");
        }
    }
    static void TearDownTestSuite() { seen.clear(); }

    static inline std::map<std::string, std::set<std::string>> seen;
    static inline std::size_t wrappers = 0;
};

TEST_F(IfxDrive, SendsTreesWithWrappersForTheDisplayToCollapse)
{
    EXPECT_GE(wrappers, 7200u);
}

TEST_F(IfxDrive, MovesThroughTheNetwork)
{
    EXPECT_GE(seen["/Serving Cell/GSM Cell/Cell ID"].size(), 10u);
    EXPECT_GE(seen["/Serving Cell/GSM Cell/LAC"].size(), 3u);
    EXPECT_GE(seen["/Serving Cell/GSM Cell/RSSI"].size(), 15u);
    EXPECT_GE(seen["/Neighbor Cells[]/ARFCN"].size(), 10u);
    EXPECT_GE(seen["/Cell Changes/0;Reselections"].size(), 10u);
    EXPECT_GE(seen["/Cell Changes/1;Handovers"].size(), 5u);
}

TEST_F(IfxDrive, ChangesStates)
{
    EXPECT_THAT(seen["/Radio Resource/Status/State"], ElementsAre("Dedicated", "Idle"));
    EXPECT_THAT(seen["/Mobility Management/MM State"],
                ElementsAre("Connection active", "Idle", "Wait for network", "Wait for release"));
    EXPECT_THAT(seen["/Mobility Management/GMM State"], ElementsAre("Registered, ready", "Registered, standby"));
    EXPECT_GE(seen["/Packet Data/Bytes Received"].size(), 100u);
}

TEST_F(IfxDrive, StaysWithinWhatGsmCanMeasure)
{
    for (const auto& level : seen["/Serving Cell/GSM Cell/RSSI"]) {
        EXPECT_GE(std::stoi(level), -110) << level;
        EXPECT_LE(std::stoi(level), -30) << level;
    }
}

} // namespace
} // namespace kestrum
