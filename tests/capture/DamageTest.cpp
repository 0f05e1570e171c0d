#include "capture/KcapReader.h"
#include "capture/Messages.h"
#include "capture/RecordReader.h"
#include "harness/FileContents.h"
#include "harness/Places.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <ctime>
#include <random>
#include <tuple>

namespace kestrum {
namespace {

using namespace std::string_literals;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;
using testing::StartsWith;

struct Scanned {
    std::vector<std::string> messages;
    std::vector<CaptureFault> faults;
    std::uint64_t lost = 0;
    std::uint64_t missing = 0; ///< as the recording's notes say
};

template <typename Reader, typename... Origin>
Scanned scanned(const std::string& stream, Origin... origin)
{
    ByteWindow window(bytesOf(stream));
    Scanned result;
    const auto report = [&](const CaptureFault& fault) {
        result.faults.push_back(fault);
        result.lost += fault.size;
    };
    Reader reader(window, OnDamage::Search, report, origin...);
    while (const auto message = reader.next())
        result.messages.emplace_back(textOf(*message));
    result.missing = reader.missing();
    return result;
}

Scanned scanKcap(const std::string& stream)
{
    return scanned<KcapReader>(stream);
}
Scanned scanDlf(const std::string& stream)
{
    return scanned<RecordReader>(stream, RecordReader::Origin::Dlf);
}
Scanned scanInterval(const std::string& stream)
{
    return scanned<RecordReader>(stream, RecordReader::Origin::Interval);
}

const std::string kFirst = message(0xB0C1, "first payload");
const std::string kSecond = message(0xB0C2, "second", kStamp + (100ull << 16));
const std::string kThird = message(0xB17F, "the third one", kStamp + (200ull << 16));
const std::string kXml = "<?xml version=\"1.0\"?><plist version=\"1.0\"><array/></plist>\n";

TEST(KcapSearch, GivesMessagesAsTheyTravelled)
{
    const auto prefixed = "\x81\x07"s + kSecond;
    const auto list = message(0, kXml, kStamp, 0xFF);
    const auto got = scanKcap(kcap(kFirst) + kcap(prefixed) + kcap(list) + kcap(kXml));
    EXPECT_THAT(got.messages, ElementsAre(kFirst, prefixed, list, kXml));
    EXPECT_THAT(got.faults, IsEmpty());
}

TEST(KcapSearch, GivesFragmentsAndUnknownTypesThatStandInOrder)
{
    const auto odd = message(0xB0C1, "odd", kStamp, 2);
    const auto got = scanKcap(kcap("abc") + kcap("") + kcap(kFirst) + kcap(odd) + kcap("x"));
    EXPECT_THAT(got.messages, ElementsAre("abc", "", kFirst, odd, "x"));
    EXPECT_THAT(got.faults, IsEmpty());
}

TEST(KcapSearch, FindsTheNextMessageBehindADamagedLength)
{
    const auto got = scanKcap(kcap(kFirst) + "\xFF\xFF\xFF\x7F" + kSecond + kcap(kThird));
    EXPECT_THAT(got.messages, ElementsAre(kFirst, kThird));
    ASSERT_THAT(got.faults, SizeIs(1));
    EXPECT_EQ(got.faults[0].offset, kcap(kFirst).size());
    EXPECT_EQ(got.faults[0].size, kcap(kSecond).size());
    EXPECT_EQ(got.faults[0].reason, "a message of 2147483647 bytes, longer than the limit of 16777216");
}

TEST(KcapSearch, DoesNotTrustALengthAfterWhichNoMessageBegins)
{
    const auto got = scanKcap(littleEndian(kSecond.size() + 9, 4) + kSecond + kcap(kThird) + kcap(kFirst));
    EXPECT_THAT(got.messages, ElementsAre(kThird, kFirst));
    EXPECT_EQ(got.lost, kcap(kSecond).size());
}

TEST(KcapSearch, TellsOfALastMessageThatIsCutShort)
{
    const auto whole = kcap(kFirst) + kcap(kSecond);
    const auto got = scanKcap(whole.substr(0, whole.size() - 3));
    EXPECT_THAT(got.messages, ElementsAre(kFirst));
    ASSERT_THAT(got.faults, SizeIs(1));
    EXPECT_EQ(got.faults[0].reason, "the last message is cut off (3 bytes missing)");
    EXPECT_EQ(got.faults[0].size, kcap(kSecond).size() - 3);
}

class GrowingCapture : public testing::TestWithParam<OnDamage> {};

TEST_P(GrowingCapture, IsWaitedForWhereAMessageIsIncomplete)
{
    const auto whole = kcap(kFirst);
    std::string there = whole.substr(0, 9);
    std::size_t read = 0;
    ByteWindow window([&](std::span<std::byte> into) {
        const auto count = there.copy(reinterpret_cast<char*>(into.data()), into.size(), read);
        read += count;
        return count;
    });
    KcapReader reader(window, GetParam(), [](const CaptureFault&) { FAIL() << "nothing is wrong"; });
    EXPECT_FALSE(reader.next(true));
    there = whole;
    window.resume();
    const auto message = reader.next(true);
    ASSERT_TRUE(message);
    EXPECT_EQ(textOf(*message), kFirst);
    EXPECT_FALSE(reader.next(true));
}

INSTANTIATE_TEST_SUITE_P(Capture, GrowingCapture, testing::Values(OnDamage::Stop, OnDamage::Search),
                         [](const auto& each) {
                             return each.param == OnDamage::Stop ? "StoppingAtDamage" : "SearchingBehindDamage";
                         });

TEST(DlfSearch, PutsTheTypeByteBeforeEachRecord)
{
    const auto got = scanDlf(kFirst.substr(1) + kSecond.substr(1) + kThird.substr(1));
    EXPECT_THAT(got.messages, ElementsAre(kFirst, kSecond, kThird));
    EXPECT_THAT(got.faults, IsEmpty());
}

TEST(DlfSearch, ReadsWhatASnapshotLeavesOfItsIntervals)
{
    const auto prefixed = "\x81\x07"s + kSecond;
    const auto list = message(1, kXml, kStamp, 0xFF);
    // The first byte of each interval is missing: a type, a prefix's marker, a service record's type.
    const auto stream =
        (kFirst + prefixed + list).substr(1) + (prefixed + kThird).substr(1) + (list + kFirst).substr(1);
    const auto got = scanDlf(stream);
    EXPECT_THAT(got.messages, ElementsAre(kFirst, prefixed, list, prefixed, kThird, list, kFirst));
    EXPECT_THAT(got.faults, IsEmpty());
}

TEST(DlfSearch, FollowsALogWhoseTimeJumps)
{
    const auto later = kStamp + (9'000'000'000ull << 16);
    const auto got = scanDlf(dlf(0xB0C1, "a") + dlf(0xB0C2, "b", later) + dlf(0xB0C1, "c", later));
    EXPECT_THAT(got.messages, SizeIs(3));
    EXPECT_THAT(got.faults, IsEmpty());
}

TEST(DlfSearch, TakesRecordsWithoutTimeStamp)
{
    const auto got = scanDlf(dlf(0xB0C1, "a", 0) + dlf(0xB0C2, "b", 0) + dlf(0xB0C1, "c", 0));
    EXPECT_THAT(got.messages, ElementsAre(message(0xB0C1, "a", 0), message(0xB0C2, "b", 0), message(0xB0C1, "c", 0)));
}

TEST(DlfSearch, SkipsWhatIsNoRecord)
{
    const auto got = scanDlf(kFirst.substr(1) + std::string(40, '#') + kSecond.substr(1) + kThird.substr(1));
    EXPECT_EQ(got.messages.size(), 3u);
    EXPECT_EQ(got.messages.back(), kThird);
    EXPECT_FALSE(got.faults.empty());
}

TEST(DlfSearch, TellsOfALastRecordThatIsCutShort)
{
    const auto whole = kFirst.substr(1) + kSecond.substr(1);
    const auto got = scanDlf(whole.substr(0, whole.size() - 2));
    EXPECT_THAT(got.messages, ElementsAre(kFirst));
    ASSERT_THAT(got.faults, SizeIs(1));
    EXPECT_EQ(got.faults[0].reason, "the last record is cut off (2 bytes missing)");
    EXPECT_EQ(got.faults[0].offset, kFirst.size() - 1);
}

TEST(IntervalSearch, SplitsMessagesThatBearTheirTypes)
{
    const auto prefixed = "\x81\x07"s + kSecond;
    const auto odd = message(0x1183, "odd", kStamp, 2);
    const auto got = scanInterval(kFirst + prefixed + odd + message(0, kXml, kStamp, 0xFF) + kThird);
    EXPECT_THAT(got.messages, ElementsAre(kFirst, prefixed, odd, message(0, kXml, kStamp, 0xFF), kThird));
    EXPECT_THAT(got.faults, IsEmpty());
}

struct Lie {
    const char* name;
    int by;

    friend void PrintTo(const Lie& shown, std::ostream* out) { *out << shown.name; }
};

class LyingLength : public testing::TestWithParam<Lie> {};

TEST_P(LyingLength, GivesWayToWhatFollows)
{
    auto lying = kSecond;
    lying.replace(1, 2, littleEndian(static_cast<std::uint64_t>(12 + 6 + GetParam().by), 2));
    const auto got = scanInterval(kFirst + lying + kThird + kFirst);
    EXPECT_THAT(got.messages, ElementsAre(kFirst, lying, kThird, kFirst));
    EXPECT_EQ(got.lost, 0u);
}

INSTANTIATE_TEST_SUITE_P(IntervalSearch, LyingLength,
                         testing::Values(Lie{"CountsTheTypeByte", 1}, Lie{"TooLong", 5}, Lie{"MuchTooLong", 40'000},
                                         Lie{"TooShort", -4}),
                         [](const auto& each) { return std::string(each.param.name); });

TEST(IntervalSearch, TakesAListThatIsLongerThanItsRecordCanCount)
{
    auto list = kXml;
    list.insert(list.find("<array/>"), "<!--" + std::string(70'000, ' ') + "-->");
    const auto service = message(1, list, kStamp, 0xFF);
    const auto got = scanInterval(kFirst + service + kSecond);
    EXPECT_THAT(got.messages, ElementsAre(kFirst, service, kSecond));
}

TEST(IntervalSearch, AccountsForEveryByteThatIsNoMessage)
{
    const auto got = scanInterval(kFirst + "fragment" + kSecond);
    EXPECT_EQ(got.messages.back(), kSecond);
    std::size_t taken = 0;
    for (const auto& each : got.messages)
        taken += each.size();
    EXPECT_EQ(taken + got.lost, (kFirst + "fragment" + kSecond).size());
}

// However a capture is damaged, its scan ends, and messages and reported gaps together account for every byte.
class DamagedCapture : public testing::Test {
protected:
    const std::string capture = kcap(kFirst) + kcap("\x81\x07"s + kSecond) + kcap(message(1, kXml, kStamp, 0xFF)) +
                                kcap(kThird) + kcap(kFirst) + kcap(kSecond);

    static void accountFor(const std::string& damaged)
    {
        const auto got = scanKcap(damaged);
        std::size_t taken = 0;
        for (const auto& each : got.messages)
            taken += 4 + each.size();
        ASSERT_EQ(taken + got.lost, damaged.size());
    }
};

TEST_F(DamagedCapture, CutAnywhere)
{
    for (std::size_t length = 0; length <= capture.size(); ++length)
        accountFor(capture.substr(0, length));
}

TEST_F(DamagedCapture, WithAnyByteFlippedLosesThatMessageAtMost)
{
    const auto all = scanKcap(capture).messages;
    for (std::size_t at = 0; at < capture.size(); ++at)
        for (const unsigned flip : {0x01u, 0x80u, 0xFFu}) {
            auto damaged = capture;
            damaged[at] = static_cast<char>(static_cast<unsigned char>(damaged[at]) ^ flip);
            accountFor(damaged);
            const auto got = scanKcap(damaged).messages;
            std::size_t intact = 0;
            for (const auto& each : got)
                intact += std::ranges::count(all, each) > 0 ? 1u : 0u;
            ASSERT_GE(intact, all.size() - 2) << "at " << at << " with " << flip;
        }
}

TEST_F(DamagedCapture, WithAnyByteFlippedADlfStreamGoesOn)
{
    const std::string stream = kFirst.substr(1) + kSecond.substr(1) + kThird.substr(1) + kFirst.substr(1);
    for (std::size_t at = 0; at < stream.size(); ++at) {
        auto damaged = stream;
        damaged[at] = static_cast<char>(~damaged[at]);
        ASSERT_GE(scanDlf(damaged).messages.size(), 2u) << "at " << at;
    }
}

RC_GTEST_PROP(AnyBytes, AreScannedToTheirEnd, (const std::vector<std::uint8_t>& bytes))
{
    const std::string stream(bytes.begin(), bytes.end());
    const auto asKcap = scanKcap(stream);
    std::size_t taken = 0;
    for (const auto& each : asKcap.messages)
        taken += 4 + each.size();
    RC_ASSERT(taken + asKcap.lost == stream.size());
    scanDlf(stream);
    const auto asInterval = scanInterval(stream);
    taken = 0;
    for (const auto& each : asInterval.messages)
        taken += each.size();
    RC_ASSERT(taken + asInterval.lost == stream.size());
}

/// The time stamps of a modem without network time: 1.25 ms since it was switched on, counted from 1980.
constexpr std::uint64_t kSwitchedOn = 12'345ull << 16;

std::string records(int count, std::uint64_t first, bool withTypes)
{
    std::string stream;
    for (int i = 0; i < count; ++i)
        stream += message(0xB0C1u + static_cast<unsigned>(i % 3), std::string(static_cast<std::size_t>(i % 40), 'p'),
                          first + (static_cast<std::uint64_t>(i * 9) << 16))
                      .substr(withTypes ? 0 : 1);
    return stream;
}

TEST(DlfSearch, TakesTheRecordsOfAModemThatHasNotHeardOfTheTime)
{
    const auto got = scanDlf(records(400, kSwitchedOn, false));
    EXPECT_THAT(got.messages, SizeIs(400));
    EXPECT_THAT(got.faults, IsEmpty());
}

TEST(DlfSearch, TakesARecordOf1980AmongOthers)
{
    const auto odd = dlf(0xB0C1, "clock not set yet", kSwitchedOn);
    const auto got = scanDlf(odd + records(30, kStamp, false) + odd + odd + records(30, kStamp, false) + odd);
    EXPECT_THAT(got.messages, SizeIs(64));
    EXPECT_THAT(got.faults, IsEmpty());
}

TEST(DlfSearch, ReadsAnIntervalOfAModemWithoutNetworkTime)
{
    const auto interval = records(40, kSwitchedOn, true);
    const auto got = scanDlf(interval.substr(1) + interval.substr(1));
    EXPECT_THAT(got.messages, SizeIs(80));
    EXPECT_THAT(got.faults, IsEmpty());
    EXPECT_THAT(scanInterval(interval).messages, SizeIs(40));
    EXPECT_THAT(scanInterval(interval).faults, IsEmpty());
}

TEST(KcapSearch, GivesAMessageThatHoldsACaptureInOnePiece)
{
    const auto holding = "a file: " + kcap(kFirst) + kcap(kSecond);
    const auto got = scanKcap(kcap(holding) + kcap(holding) + kcap("ab") + kcap(""));
    EXPECT_THAT(got.messages, ElementsAre(holding, holding, "ab", ""));
    EXPECT_THAT(got.faults, IsEmpty());
}

TEST(KcapSearch, KeepsOddMessagesBeforeACutEnd)
{
    const auto got = scanKcap(kcap("odd") + kcap("") + kcap("odder") + kcap(kFirst).substr(0, 20));
    EXPECT_THAT(got.messages, ElementsAre("odd", "", "odder"));
    EXPECT_THAT(got.faults, SizeIs(1));
}

TEST(KcapSearch, FindsABinaryPropertyListBehindDamage)
{
    const auto list = contentsOf(inCheckout("fuzz/corpus/propertylist/all.bplist"));
    ASSERT_THAT(list, StartsWith("bplist"));
    const auto got = scanKcap(kcap(kFirst) + "\xFF\xFF\xFF\xFFgarbage" + kcap(list) + kcap(list));
    EXPECT_THAT(got.messages, ElementsAre(kFirst, list, list));
}

using Text = std::vector<std::uint8_t>;

std::string textOfAny(const Text& bytes)
{
    return {bytes.begin(), bytes.end()};
}

/// Empty messages, zeros, a few bytes and whole records among messages of any bytes.
rc::Gen<std::string> anyMessage()
{
    const auto any = rc::gen::map(rc::gen::arbitrary<Text>(), textOfAny);
    const auto zeros = rc::gen::map(rc::gen::inRange(0, 30),
                                    [](int count) { return std::string(static_cast<std::size_t>(count), '\0'); });
    const auto record = rc::gen::map(any, [](const std::string& payload) { return message(0xB0C1, payload); });
    const auto nested = rc::gen::map(record, [](const std::string& held) { return "x" + kcap(held) + kcap(held); });
    return rc::gen::oneOf(any, zeros, record, nested);
}

RC_GTEST_PROP(WellFramed, KcapIsReadWholeWhateverItsMessagesHold, ())
{
    const auto messages = *rc::gen::container<std::vector<std::string>>(anyMessage());
    std::string stream;
    for (const auto& each : messages)
        stream += kcap(each);
    const auto got = scanKcap(stream);
    RC_ASSERT(got.messages == messages);
    RC_ASSERT(got.faults.empty());
}

RC_GTEST_PROP(WellFramed, DlfIsReadWholeWhateverItsTimeStamps, ())
{
    const auto stamp = rc::gen::oneOf(
        rc::gen::arbitrary<std::uint64_t>(), rc::gen::element<std::uint64_t>(0, kStamp),
        rc::gen::inRange<std::uint64_t>(0, 1ull << 40),
        rc::gen::map(rc::gen::arbitrary<std::uint8_t>(), [](std::uint64_t byte) { return byte * 0x0101010101010101; }));
    const auto each = rc::gen::tuple(rc::gen::arbitrary<std::uint16_t>(), anyMessage(), stamp);
    std::string stream;
    std::vector<std::string> payloads;
    for (const auto& [code, payload, at] :
         *rc::gen::container<std::vector<std::tuple<std::uint16_t, std::string, std::uint64_t>>>(each)) {
        stream += dlf(code, payload, at);
        payloads.push_back(payload);
    }
    const auto got = scanDlf(stream);
    RC_ASSERT(got.messages.size() == payloads.size());
    RC_ASSERT(got.faults.empty());
    for (std::size_t i = 0; i < payloads.size(); ++i)
        RC_ASSERT(got.messages[i].substr(13) == payloads[i]);
}

// No zeros: half of a record's length and time bytes are zero, so enough of them can be taken for a record.
rc::Gen<Text> someBytes(int least, int most)
{
    return rc::gen::container<Text>(static_cast<std::size_t>(*rc::gen::inRange(least, most)),
                                    rc::gen::cast<std::uint8_t>(rc::gen::inRange(1, 256)));
}

/// A stream in which some bytes were overwritten, and the undamaged messages after them.
struct Damaged {
    std::string stream;
    std::vector<std::string> behind;
};

Damaged damaged(const std::vector<std::string>& messages, std::string (*framed)(const std::string&))
{
    Damaged result;
    std::vector<std::size_t> begins;
    for (const auto& each : messages) {
        begins.push_back(result.stream.size());
        result.stream += framed(each);
    }
    const auto at = *rc::gen::inRange<std::size_t>(0, begins[messages.size() / 2]);
    const auto noise = *someBytes(1, 60);
    const auto count = std::min(noise.size(), result.stream.size() - at);
    result.stream.replace(at, count, textOfAny(noise), 0, count);
    for (std::size_t i = 0; i < messages.size(); ++i)
        if (begins[i] >= at + noise.size())
            result.behind.push_back(messages[i]);
    return result;
}

std::vector<std::string> drive()
{
    std::vector<Text> payloads;
    for (int count = *rc::gen::inRange(8, 40); count > 0; --count)
        payloads.push_back(*someBytes(0, 60));
    std::vector<std::string> messages;
    for (const auto& each : payloads)
        messages.push_back(message(0xB0C1, textOfAny(each), kStamp + (messages.size() * 40 << 16)));
    return messages;
}

bool endsWith(const std::vector<std::string>& all, const std::vector<std::string>& last)
{
    return all.size() >= last.size() && std::equal(last.rbegin(), last.rend(), all.rbegin());
}

RC_GTEST_PROP(OverwrittenBytes, HideNoMessageOfAKcapBehindThem, ())
{
    const auto [stream, behind] = damaged(drive(), [](const std::string& each) { return kcap(each); });
    const auto got = scanKcap(stream);
    // Except when the new lengths lead to the end as well.
    RC_ASSERT(endsWith(got.messages, behind) || got.faults.empty());
}

// Only lengths and time stamps show where records begin, so bytes of two records can be taken for a third. That is
// rare: in all but a few of a thousand cases the scan finds every whole record after the damage.
TEST(OverwrittenBytes, HideRecordsOfADlfHardlyEver)
{
    std::mt19937 random(7); // the same cases in every run
    const auto bytes = [&](std::size_t most) {
        std::string text(random() % most, ' ');
        for (char& each : text)
            each = static_cast<char>(1 + random() % 255);
        return text;
    };
    int hidden = 0;
    for (int run = 0; run < 1000; ++run) {
        std::string stream;
        std::vector<std::string> all;
        std::vector<std::size_t> begins;
        for (std::uint64_t i = 0; i < 30; ++i) {
            all.push_back(message(0xB0C1, bytes(60), kStamp + (i * 40 << 16)));
            begins.push_back(stream.size());
            stream += all.back().substr(1);
        }
        const auto noise = "#" + bytes(60);
        const auto at = random() % begins[20];
        stream.replace(at, noise.size(), noise);
        const auto first = std::ranges::lower_bound(begins, at + noise.size()) - begins.begin();
        hidden += endsWith(scanDlf(stream).messages, {all.begin() + first, all.end()}) ? 0 : 1;
    }
    EXPECT_LE(hidden, 10);
}

TEST(HostileStreams, OfFalseHeadsAreScannedInLinearTime)
{
    // Only headers with great lengths, all of them false.
    std::string heads;
    while (heads.size() < (1u << 20))
        heads += littleEndian(0xFFFFFF, 4) + "\x01\xFE\xFF\xC1\xB0" + littleEndian(kStamp, 8);
    EXPECT_THAT(scanKcap(heads).messages, IsEmpty());
    const auto got = scanDlf(heads);
    EXPECT_LE(got.messages.size(), heads.size() / 12);
}

TEST(HostileStreams, OfServiceRecordsWhoseListsNeverEndAreScannedInLinearTime)
{
    const auto seconds = [](std::size_t records) {
        std::string stream;
        for (std::size_t i = 0; i < records; ++i)
            stream += message(static_cast<unsigned>(i % 3), "<?xml version='1.0'?><plist>", kStamp + (i << 16), 0xFF);
        const auto before = std::clock();
        EXPECT_LE(scanDlf(stream).messages.size(), records);
        return static_cast<double>(std::clock() - before) / CLOCKS_PER_SEC;
    };
    // Ten times the input may take ten times as long. A quadratic algorithm would take a hundred times as long.
    const double few = seconds(5'000);
    EXPECT_LT(seconds(50'000), 40 * few + 1);
}

// Notes of missing messages.

TEST(KcapNotes, AreCountedAndAreNoMessages)
{
    const auto found =
        scanKcap(kcap("one") + note(3) + note(std::uint64_t{1} << 33) + kcap("") + note(0) + kcap("two"));
    EXPECT_THAT(found.messages, ElementsAre("one", "", "two"));
    EXPECT_EQ(found.missing, (std::uint64_t{1} << 33) + 3);
    EXPECT_THAT(found.faults, IsEmpty());
}

TEST(KcapNotes, AreFoundBehindDamage)
{
    const auto found = scanKcap(kcap("one") + "#####" + note(3) + kcap(message(0xB0C2, "payload")));
    EXPECT_THAT(found.messages, ElementsAre("one", message(0xB0C2, "payload")));
    EXPECT_EQ(found.missing, 3u);
    EXPECT_EQ(found.lost, 5u);
}

TEST(KcapNotes, MayEndTooEarly)
{
    const auto found = scanKcap(kcap(message(0xB0C2, "payload")) + note(3).substr(0, 7));
    EXPECT_THAT(found.messages, ElementsAre(message(0xB0C2, "payload")));
    EXPECT_EQ(found.missing, 0u);
    EXPECT_EQ(found.lost, 7u);
}

} // namespace
} // namespace kestrum
