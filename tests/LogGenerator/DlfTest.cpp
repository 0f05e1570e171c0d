#include "LogGenerator/DlfVersionReport.h"
#include "LogGenerator/Messages.h"
#include "LogGenerator/Sections.h"

#include <gmock/gmock.h>

#include <array>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

std::string textAt(Bytes bytes, std::size_t offset, std::size_t width)
{
    return std::string(textOf(bytes.subspan(offset, width)));
}

std::uint64_t numberAt(Bytes bytes, std::size_t offset, std::size_t width)
{
    std::uint64_t number = 0;
    for (std::size_t i = width; i-- > 0;)
        number = number << 8 | std::to_integer<std::uint64_t>(bytes[offset + i]);
    return number;
}

// The version report alone.

TEST(VersionReport, IsByteForByte)
{
    std::array<std::byte, 161> report;
    report.fill(std::byte{0xEE});
    std::uint32_t written = 0;
    // 2026-11-16 06:05:42 UTC, 210 minutes west, daylight saving.
    const int result = QrelDLFAddVersionReport(report.data(), 161, written, 1, 1, "Kestrum 1.0", "EXECUTABLE_NAME",
                                               "Aug  1 2017 22:02:27", 0x0001'FF2E'6AF9'3986);
    EXPECT_EQ(result, 0);
    EXPECT_EQ(written, 161u);

    std::string expected("\xA1\x00\xFD\x1F", 4); // length 161, code 0x1FFD
    expected.append(8, '\0');                    // time stamp
    expected.append("\x01\x00\x01\x00", 4);      // report numbers
    expected.append("Kestru\0", 7);              // cut to six characters
    expected.append("EXECUTABLE_NAME\0", 16);
    expected.append(24, '\0');
    expected.append("Aug  1 2017 22:02\0", 18); // cut to seventeen
    expected.append("\x86\x39\xF9\x6A", 4);     // seconds since 1970
    expected.append("\x2E\xFF", 2);             // -210 minutes
    expected.append("\x01\x00", 2);             // daylight saving
    expected.append(72, '\0');
    ASSERT_EQ(expected.size(), 161u);
    EXPECT_EQ(textOf(report), expected);
}

TEST(VersionReport, NeedsItsWholeSize)
{
    std::array<std::byte, 161> report;
    report.fill(std::byte{0xEE});
    std::uint32_t written = 7;
    EXPECT_EQ(QrelDLFAddVersionReport(report.data(), 160, written, 1, 1, "v", "e", "b", 0), 3);
    EXPECT_EQ(written, 0u);
    EXPECT_EQ(std::ranges::count(report, std::byte{0xEE}), 161);
}

TEST(VersionReport, LargerBufferIsLeftAloneBehindTheReport)
{
    std::array<std::byte, 200> buffer;
    buffer.fill(std::byte{0xEE});
    std::uint32_t written = 0;
    EXPECT_EQ(QrelDLFAddVersionReport(buffer.data(), 200, written, 1, 1, "v", "e", "b", 0), 0);
    EXPECT_EQ(written, 161u);
    EXPECT_EQ(std::ranges::count(std::span(buffer).subspan(161), std::byte{0xEE}), 39);
}

TEST(VersionReport, TakesTheReportNumbersOfItsCaller)
{
    std::array<std::byte, 161> report;
    std::uint32_t written = 0;
    QrelDLFAddVersionReport(report.data(), 161, written, 0x1234, 0xFEDC, "v", "e", "b", 0);
    EXPECT_EQ(numberAt(report, 12, 2), 0x1234u);
    EXPECT_EQ(numberAt(report, 14, 2), 0xFEDCu);
}

TEST(VersionReport, ShortTextsArePaddedWithNuls)
{
    std::array<std::byte, 161> report;
    report.fill(std::byte{0xEE});
    std::uint32_t written = 0;
    QrelDLFAddVersionReport(report.data(), 161, written, 1, 1, "v", "", "b", 0);
    EXPECT_EQ(textAt(report, 16, 7), std::string("v\0\0\0\0\0\0", 7));
    EXPECT_EQ(textAt(report, 23, 16), std::string(16, '\0'));
    EXPECT_EQ(textAt(report, 63, 18), "b" + std::string(17, '\0'));
}

TEST(VersionReport, TextOfExactlyItsFieldIsCutForTheNul)
{
    std::array<std::byte, 161> report;
    std::uint32_t written = 0;
    QrelDLFAddVersionReport(report.data(), 161, written, 1, 1, "1234567", "1234567890123456", "123456789012345678", 0);
    EXPECT_EQ(textAt(report, 16, 7), std::string("123456\0", 7));
    EXPECT_EQ(textAt(report, 23, 16), std::string("123456789012345\0", 16));
    EXPECT_EQ(textAt(report, 63, 18), std::string("12345678901234567\0", 18));
}

// The stream that a generator writes from its history.

class Dlf : public testing::Test {
protected:
    void historyIs(std::vector<Value> displayStates)
    {
        auto history = makeArray();
        for (auto& each : displayStates)
            history->append(makeDictionaryUntilNull({{"DisplayState", each}, {"Display", makeDictionary()}}));
        doubles.state.set("History", history);
    }
    std::vector<std::byte> records() const
    {
        const auto dlf = generator.generateDlfFromState(doubles.state);
        const auto bytes = dlf->bytes().subspan(161);
        return {bytes.begin(), bytes.end()};
    }

    SampleDoubles doubles;
    sample::Generator generator{doubles.roles};
};

TEST_F(Dlf, OfAnEmptyHistoryIsTheReportAlone)
{
    const auto dlf = generator.generateDlfFromState(doubles.state);
    ASSERT_TRUE(dlf);
    ASSERT_EQ(dlf->size(), 161u);
    const auto bytes = dlf->bytes();
    EXPECT_EQ(numberAt(bytes, 0, 2), 161u);
    EXPECT_EQ(numberAt(bytes, 2, 2), 0x1FFDu);
    EXPECT_EQ(numberAt(bytes, 4, 8), 0u);
    EXPECT_EQ(numberAt(bytes, 12, 2), 1u);
    EXPECT_EQ(numberAt(bytes, 14, 2), 1u);
    EXPECT_EQ(textAt(bytes, 16, 7), std::string("Kestru\0", 7));
    EXPECT_EQ(textAt(bytes, 23, 16), std::string("EXECUTABLE_NAME\0", 16));
    EXPECT_EQ(textAt(bytes, 39, 24), std::string(24, '\0'));
    // "Nov 20 2026 13:55": month, day, year, hour and minute of the build.
    EXPECT_THAT(textAt(bytes, 63, 17),
                testing::MatchesRegex("[A-Z][a-z][a-z] [ 123][0-9] 20[0-9][0-9] [0-9][0-9]:[0-9][0-9]"));
    EXPECT_EQ(bytes[80], std::byte{0});
    EXPECT_EQ(numberAt(bytes, 81, 4), 1794809142u); // 2026-11-16 06:05:42 UTC
    EXPECT_EQ(numberAt(bytes, 85, 2), 0u);
    EXPECT_EQ(numberAt(bytes, 87, 2), 0u);
    EXPECT_EQ(textAt(bytes, 89, 72), std::string(72, '\0'));
}

TEST_F(Dlf, SecondsAreCutNotRounded)
{
    doubles.clock.date += std::chrono::milliseconds(999);
    EXPECT_EQ(numberAt(generator.generateDlfFromState(doubles.state)->bytes(), 81, 4), 1794809142u);
}

TEST_F(Dlf, VersionFieldHoldsSixCharactersWhateverTheVersion)
{
    for (const auto& version :
         {std::optional<std::string>("12.345.6789"), std::optional<std::string>("2"), std::optional<std::string>()}) {
        doubles.bundle.bundleVersion = version;
        EXPECT_EQ(textAt(generator.generateDlfFromState(doubles.state)->bytes(), 16, 7), std::string("Kestru\0", 7));
    }
}

struct ZoneCase {
    const char* name;
    int seconds;
    bool daylightSaving;
    std::uint64_t minutes;

    friend void PrintTo(const ZoneCase& shown, std::ostream* out) { *out << shown.name; }
};

class DlfZone : public Dlf, public testing::WithParamInterface<ZoneCase> {};

TEST_P(DlfZone, IsStoredInMinutes)
{
    doubles.clock.zone = {std::chrono::seconds(GetParam().seconds), GetParam().daylightSaving};
    const auto dlf = generator.generateDlfFromState(doubles.state);
    EXPECT_EQ(numberAt(dlf->bytes(), 85, 2), GetParam().minutes);
    EXPECT_EQ(numberAt(dlf->bytes(), 87, 2), GetParam().daylightSaving ? 1u : 0u);
}

INSTANTIATE_TEST_SUITE_P(Zones, DlfZone,
                         testing::Values(ZoneCase{"Utc", 0, false, 0},
                                         ZoneCase{"ThreeAndAHalfHoursWest", -12600, false, 0xFF2E}, // -210
                                         ZoneCase{"SummerInTheEast", 7200, true, 120},
                                         ZoneCase{"FarthestEast", 50400, false, 840},
                                         ZoneCase{"SecondsAreCutTowardZeroInTheEast", 1059, false, 17},
                                         ZoneCase{"SecondsAreCutTowardZeroInTheWest", -1059, false, 0xFFEF}), // -17
                         [](const auto& each) { return std::string(each.param.name); });

TEST_F(Dlf, ZoneIsThatOfTheTimeOfWriting)
{
    const auto zoneAndFlag = [this] {
        const auto dlf = generator.generateDlfFromState(doubles.state);
        return std::pair(numberAt(dlf->bytes(), 85, 2), numberAt(dlf->bytes(), 87, 2));
    };
    doubles.clock.zone = {std::chrono::hours(2), true};
    doubles.clock.zoneAfterChange = {std::chrono::hours(1), false};
    doubles.clock.zoneChange = doubles.clock.date + std::chrono::seconds(1);
    EXPECT_EQ(zoneAndFlag(), std::pair(std::uint64_t{120}, std::uint64_t{1}));
    doubles.clock.date = doubles.clock.zoneChange;
    EXPECT_EQ(zoneAndFlag(), std::pair(std::uint64_t{60}, std::uint64_t{0}));
}

TEST_F(Dlf, LeavesOutTheFirstByteOfEachInterval)
{
    const auto first = bytesFrom({1, 2, 3}), second = bytesFrom({4, 5});
    historyIs({Data(first), Data(second)});
    EXPECT_EQ(records(), bytesFrom({2, 3, 5}));
}

TEST_F(Dlf, OneByteAddsNothingAndTwoAddOne)
{
    historyIs({Data(bytesFrom({1}))});
    EXPECT_THAT(records(), IsEmpty());
    historyIs({Data(bytesFrom({1, 2}))});
    EXPECT_EQ(records(), bytesFrom({2}));
    historyIs({Data()});
    EXPECT_THAT(records(), IsEmpty());
}

TEST_F(Dlf, EntryWithoutDisplayStateIsPassedOver)
{
    historyIs({Value(), Data(bytesFrom({1, 2}))});
    EXPECT_EQ(records(), bytesFrom({2}));
}

TEST_F(Dlf, FurtherTypeBytesAndPrefixesStay)
{
    const auto prefixed = [] {
        auto bytes = message(1, 0x4002, {8});
        bytes.insert(bytes.begin(), {std::byte{0x81}, std::byte{0}});
        return bytes;
    }();
    generator.updateState(doubles.state, message(1, 0x4002, {7}));
    generator.updateState(doubles.state, prefixed);
    generator.generateLogUsingState(doubles.state);

    auto expected = message(1, 0x4002, {7});
    expected.erase(expected.begin());
    expected.insert(expected.end(), prefixed.begin(), prefixed.end());
    EXPECT_EQ(records(), expected);
}

TEST_F(Dlf, DisplayStateOfAnotherKindAbortsIt)
{
    historyIs({Data(bytesFrom({1, 2})), "an object of another technology"});
    doubles.log.lines.clear();
    EXPECT_FALSE(generator.generateDlfFromState(doubles.state));
    EXPECT_THAT(doubles.log.lines,
                ElementsAre(RecordingLog::Line(
                    Priority::Raw16, "Got wrong class writing history to DLF; aborting writing the DLF file")));
    EXPECT_EQ(static_cast<int>(Priority::Raw16), 16);
}

TEST_F(Dlf, SaveContentsEndWithIt)
{
    historyIs({Data(bytesFrom({1, 2, 3}))});
    const auto contents = generator.getSaveContentsFromState(doubles.state);
    ASSERT_EQ(contents->size(), 2u);
    EXPECT_EQ((*contents)[0].dictionary()->at("DisplayState"), Value(Data(bytesFrom({1, 2, 3}))));
    const auto last = (*contents)[1].dictionary();
    EXPECT_EQ(last->size(), 2u);
    EXPECT_EQ(last->at("Description"), Value("DLF binary (163 bytes)"));
    EXPECT_EQ(last->at("DLF").data()->size(), 163u);
}

TEST_F(Dlf, SaveContentsOfAnEmptyHistoryAreTheReportAlone)
{
    const auto contents = generator.getSaveContentsFromState(doubles.state);
    ASSERT_EQ(contents->size(), 1u);
    EXPECT_EQ((*contents)[0].dictionary()->at("Description"), Value("DLF binary (161 bytes)"));
}

TEST_F(Dlf, SaveContentsGoWithoutItWhenItFails)
{
    historyIs({"an object of another technology"});
    const auto contents = generator.getSaveContentsFromState(doubles.state);
    EXPECT_EQ(contents->size(), 1u);
}

TEST_F(Dlf, SaveContentsAreAListOfTheirOwn)
{
    historyIs({Data(bytesFrom({1, 2}))});
    generator.getSaveContentsFromState(doubles.state)->clear();
    EXPECT_EQ(doubles.state.at("History").array()->size(), 1u);
}

} // namespace
} // namespace kestrum
