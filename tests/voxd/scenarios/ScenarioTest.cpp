#include "voxd/scenarios/ScenarioRun.h"

#include "support/Format.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <charconv>
#include <fstream>
#include <iterator>
#include <ostream>
#include <set>

#include <unistd.h>

namespace kestrum {
namespace {

using namespace std::chrono;
using namespace std::chrono_literals;

/// The numbers that a key may show, anywhere in the tree.
struct Range {
    const char* key;
    double least, most;
};

struct Case {
    const char* scenario;
    double leastRate, mostRate;             ///< messages per simulated second
    std::vector<std::string> emptyByDesign; ///< paths that never show anything
    std::vector<Range> ranges;

    friend void PrintTo(const Case& shown, std::ostream* out) { *out << shown.scenario; }
};

class Scenarios : public testing::TestWithParam<Case> {
protected:
    std::string name() const { return GetParam().scenario; }

    std::unique_ptr<Source> source(std::uint64_t seed, Date start = ScenarioRun::kStart) const
    {
        return makeScenario(name(), {seed, start, ScenarioRun::kLists});
    }
    static std::vector<std::vector<std::byte>> first(Source& from, std::size_t count)
    {
        std::vector<std::vector<std::byte>> messages;
        while (messages.size() < count)
            messages.push_back(from.next()->bytes);
        return messages;
    }
};

// Scenarios whose technology does not change.
class OneTechnology : public Scenarios {};

TEST_P(Scenarios, EqualSeedsGiveEqualBytes)
{
    EXPECT_EQ(first(*source(7), 3000), first(*source(7), 3000));
}

TEST_P(Scenarios, OtherSeedsGiveOtherBytes)
{
    EXPECT_NE(first(*source(7), 1000), first(*source(8), 1000));
}

TEST_P(Scenarios, MessagesComeInOrderAndAreStampedWithTheirTime)
{
    const auto from = source(3);
    microseconds before{0};
    for (int i = 0; i < 8000; ++i) {
        const auto message = *from->next();
        ASSERT_GE(message.at, before);
        before = message.at;
        const auto record = channelRecord(message.bytes);
        ASSERT_TRUE(record);
        EXPECT_EQ(record->timeStamp & 0xFFFF, 0u);
        const auto late = ScenarioRun::kStart + message.at - dateFromTimeStamp(record->timeStamp);
        EXPECT_GE(late, 0us);
        EXPECT_LT(late, 1250us);
    }
}

TEST_P(Scenarios, RecordsSayHowLongTheyAre)
{
    const auto from = source(4);
    int prefixed = 0;
    constexpr int kMessages = 8000;
    for (int i = 0; i < kMessages; ++i) {
        const auto message = from->next()->bytes;
        const auto byte = [&](std::size_t at) { return std::to_integer<std::size_t>(message.at(at)); };
        const std::size_t prefix = byte(0) == 0x81 ? 2 : 0;
        prefixed += prefix > 0;
        ASSERT_EQ(byte(prefix + 1) + 256 * byte(prefix + 2), message.size() - prefix - 1);
    }
    EXPECT_GT(prefixed, kMessages / 100);
    EXPECT_LT(prefixed, kMessages / 20);
}

TEST_P(Scenarios, EveryCodeOfTheStartCommandComes)
{
    ScenarioRun run(name());
    std::set<std::string> seen, wanted;
    const auto entry = [&](std::int64_t code) {
        return std::string(run.generator->technology()) + formatted(" 0x%lx", static_cast<unsigned long>(code));
    };
    run.decodeFor(5min, [&] {
        if (!seen.insert(entry(run.code)).second)
            return;
        const auto command = run.generator->getStartCommand();
        for (const auto& [key, extra] : {std::pair("SetZephraLogCodes", 0), std::pair("SetVoxExtraCodes", 0xFF0000)})
            if (const auto codes = command->at(key).array())
                for (const auto& each : *codes)
                    wanted.insert(entry(*each.integer() + extra));
    });
    EXPECT_GE(wanted.size(), 8u);
    std::vector<std::string> missing;
    std::ranges::set_difference(wanted, seen, std::back_inserter(missing));
    EXPECT_THAT(missing, testing::IsEmpty());
}

TEST_P(Scenarios, RatesAreLifelike)
{
    const auto from = source(5);
    std::size_t count = 0, bytes = 0, most = 0, second = 0;
    seconds current{0};
    for (auto message = from->next(); message->at < 5min; message = from->next()) {
        ++count;
        bytes += message->bytes.size();
        if (const auto now = floor<seconds>(message->at); now != current) {
            current = now;
            second = 0;
        }
        most = std::max(most, ++second);
    }
    const double rate = static_cast<double>(count) / 300;
    RecordProperty("messagesPerSecond", static_cast<int>(rate));
    RecordProperty("bytesPerSecond", static_cast<int>(bytes / 300));
    EXPECT_GE(rate, GetParam().leastRate);
    EXPECT_LE(rate, GetParam().mostRate);
    EXPECT_LE(static_cast<double>(most), 2 * GetParam().mostRate);
}

bool showsNothing(const std::string& text)
{
    return text.empty() || text == "\"\"" || text == "[]";
}

bool isUnknown(const std::string& text)
{
    return text.find("Unknown") != text.npos || text.find("??") != text.npos || text.find("[Bad") != text.npos ||
           text.find("[Reserved") != text.npos || text.find("unknown") != text.npos || text.find("nan") != text.npos ||
           text.find("inf") != text.npos;
}

TEST_P(OneTechnology, EveryKeyOfTheDisplayShowsSomethingKnown)
{
    ScenarioRun run(name());
    std::set<std::string> all, shown, unknown;
    std::size_t messages = 0;
    run.decodeFor(5min, [&] {
        if (++messages % 397 == 0)
            eachText(run.display(), "", [&](const std::string& path, const std::string& text) {
                all.insert(path);
                if (isUnknown(text))
                    unknown.insert(path + ": " + text);
                else if (!showsNothing(text))
                    shown.insert(path);
            });
    });
    EXPECT_GT(shown.size(), 20u);
    EXPECT_THAT(unknown, testing::IsEmpty());
    std::vector<std::string> blank;
    for (const auto& path : all)
        // A list shows its texts in its rows.
        if (!shown.contains(path) &&
            std::ranges::none_of(shown, [&](const auto& row) { return row.starts_with(path + "[]"); }))
            blank.push_back(path);
    EXPECT_THAT(blank, testing::UnorderedElementsAreArray(GetParam().emptyByDesign));
}

TEST_P(OneTechnology, ShowsPlausibleNumbers)
{
    ScenarioRun run(name(), 11);
    std::map<std::string, Range> ranges;
    std::map<std::string, std::set<std::string>> wrong;
    std::set<std::string> checked;
    for (const auto& each : GetParam().ranges)
        ranges.emplace(each.key, each);
    std::size_t messages = 0;
    run.decodeFor(5min, [&] {
        if (++messages % 401 == 0)
            eachText(run.display(), "", [&](const std::string& path, const std::string& text) {
                const auto slash = path.rfind('/');
                const auto found = ranges.find(path.substr(slash == path.npos ? 0 : slash + 1));
                const char* digits = text.data() + (text.starts_with('+') || text.starts_with(' '));
                double number = 0;
                if (found == ranges.end() || text.empty() ||
                    std::from_chars(digits, text.data() + text.size(), number).ec != std::errc())
                    return;
                checked.insert(found->first);
                if (number < found->second.least || number > found->second.most)
                    wrong[path].insert(text);
            });
    });
    EXPECT_THAT(wrong, testing::IsEmpty());
    for (const auto& each : GetParam().ranges)
        EXPECT_TRUE(checked.contains(each.key)) << each.key << " was never shown as a number";
}

TEST_P(Scenarios, DecodesWithoutErrors)
{
    ScenarioRun run(name(), 2);
    run.decodeFor(5min);
    std::vector<std::string> errors;
    for (const auto& [text, count] : run.log.counts) {
        const bool known =
            text.starts_with("Creating ") || text.starts_with("Created ") || text.starts_with("Class Index: ") ||
            text == "Received an unknown log message: 45249"; // 0xB0C1 is decoded, but reported nevertheless
        // Numbers that the cell monitor sometimes does not know.
        const bool missing = text.find("Failed to retrieve ") != text.npos;
        EXPECT_TRUE(!missing || count < 400) << text << count;
        if (!known && !missing)
            errors.push_back(text);
    }
    EXPECT_THAT(errors, testing::IsEmpty());
}

long residentPages()
{
    long size = 0, resident = 0;
    std::ifstream("/proc/self/statm") >> size >> resident;
    return resident;
}

// Hours of driving in an optimised build, less in others. bench_scenarios drives a whole day.
TEST_P(Scenarios, StayWithinBoundsOfMemoryForLong)
{
#ifdef NDEBUG
    constexpr auto kLong = 4h;
#else
    constexpr auto kLong = 15min;
#endif
    ScenarioRun run(name(), 6);
    run.decodeFor(5min);
    const long before = residentPages();
    run.decodeFor(kLong - 5min);
    const long grown = (residentPages() - before) * sysconf(_SC_PAGESIZE);
    EXPECT_LT(grown, 4 << 20);
    EXPECT_LE(run.state.at("History").array()->size(), 5u);
}

const std::vector<Range> kLteRanges{
    {"Physical Cell ID", 0, 503},
    {"Serving Physical Cell ID", 0, 503},
    {"Measured RSRP", -128, -65},
    {"Average RSRP", -124.5, -65},
    {"Serving Filtered RSRP", -125, -65},
    {"Filtered RSRP", -128, -65},
    {"Measured RSRQ", -19.5, -3},
    {"Average RSRQ", -19.5, -3},
    {"Serving Filtered RSRQ", -19.5, -3},
    {"Filtered RSRQ", -19.5, -3},
    {"Measured RSSI", -100, -13},
    {"Qrxlevmin", -124, -124},
    {"Srxlev", -1, 60},
    {"Subframe Number", 0, 10239},
    {"Num Tx Antennas", 2, 4},
    {"Ant 0 Frame Offset", 0, 1023},
    {"Ant 0 Sample Offset", 0, 307203},
};

const std::vector<Range> kGsmRanges{
    {"BSIC", 0, 63},
    {"Serving Rx Level", 0, 63},
    {"C2 Value", 0, 75},
    {"Scrambling Code", 0, 511},
    {"RSCP", -125, -40},
    {"Rank Cell RSCP", -125, -40},
    {"Energy Per Chip", -24, 0},
    {"UARFCN", 10562, 10838},
    {"Uplink Frequency", 9612, 9888},
    {"Transmit Power", -52, 24},
    {"Routing Area Code", 1, 2},
    {"ARFCN", 1, 124},
};

// Lists that no record fills, and lists that records only empty.
const std::vector<std::string> kGsmEmpty{
    "2;UMTS/Detected Set",
    "2;UMTS/Monitored Set",
    "2;UMTS/Virtual Active Set",
    "3;Reselection/Non-Ranked GSM Set",
    "3;Reselection/Non-Ranked UMTS Set",
};

const std::vector<Range> kCdmaRanges{
    {"1;System ID", 16390, 16422}, {"3;Rx0 AGC", -110, -20}, {"2;Rx0 AGC", -106, -20},
    {"6;Tx AGC", -60, 24},         {"3;Traffic FER", 0, 15},
};

const std::vector<Range> kUtranRanges{
    {"Downlink UARFCN", 10054, 10121},
    {"Cell Scrambling Code", 0, 127},
    {"Filter RSCP", 0, 0.36},
    {"TRCH BLER Measurement", 0, 10},
    {"TSNUM", 0, 6},
};

const Case kLte{"lte", 100, 300, {}, kLteRanges};
const Case kGsm{"gsm", 100, 300, kGsmEmpty, kGsmRanges};
const Case kCdma{"cdma", 120, 300, {}, kCdmaRanges};
const Case kUtran{"utran", 100, 300, {"1;Neighbors/GSM Neighbor Cell List"}, kUtranRanges};
const Case kDrive{"drive", 100, 300, {}, {}};

const auto nameOfCase = [](const auto& each) { return std::string(each.param.scenario); };

INSTANTIATE_TEST_SUITE_P(Live, Scenarios, testing::Values(kLte, kGsm, kCdma, kUtran, kDrive), nameOfCase);
INSTANTIATE_TEST_SUITE_P(Live, OneTechnology, testing::Values(kLte, kGsm, kCdma, kUtran), nameOfCase);

} // namespace
} // namespace kestrum
