#include "tools/Snapshot.h"
#include "Tool.h"
#include "capture/Messages.h"
#include "doubles/DecodingDoubles.h"
#include "harness/Scratch.h"
#include "platform/posix/LinuxBundle.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "tools/Decoding.h"
#include "voxd/scenarios/Scenario.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

namespace kestrum::tools {
namespace {

using namespace std::string_literals;
using testing::ElementsAreArray;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

/// The contents that the save screen writes.
DictionaryRef snapshotOf(const Value& contents)
{
    return makeDictionary(
        {{"Timestamp", "2026-11-16 06:05:42 +0000"}, {"Data", contents}, {"Description", "behind the station"}});
}

Value dataOf(std::string_view bytes)
{
    return Data(bytesOf(bytes));
}

/// A live run of a scenario: five refresh intervals, then Save.
class LiveRun {
public:
    explicit LiveRun(std::string_view scenario)
    {
        const auto source = makeScenario(scenario, {7, *dateFromIso("2026-11-16T06:05:42Z"), codec});
        generator = LogGenerator::generatorFromTechnology(source->technology(), roles);
        for (int interval = 1; interval <= 5; ++interval) {
            for (auto next = source->next(); next->at < std::chrono::seconds(interval); next = source->next()) {
                generator->updateState(state, next->bytes);
                messages.emplace_back(textOf(next->bytes));
            }
            generator->generateLogUsingState(state);
        }
    }

    DictionaryRef saved() const { return snapshotOf(deepCopy(generator->getSaveContentsFromState(state))); }
    Value display() const { return state.at("Display"); }

    DecodingDoubles doubles;
    LinuxBundle bundle{{inCheckout("resources")}};
    PropertyListCodec codec;
    DecodingRoles roles{doubles.log, doubles.console, doubles.clock, bundle, codec};
    State state;
    std::unique_ptr<LogGenerator> generator;
    std::vector<std::string> messages;
};

struct Recovered {
    std::vector<std::string> messages;
    std::vector<std::string> faults;
    Value display;
};

Recovered recovered(const Value& snapshot)
{
    LinuxBundle bundle({inCheckout("resources")});
    PropertyListCodec codec;
    Recovered result;
    const Snapshot opened("a.kestrum", snapshot,
                          [&](const CaptureFault& fault) { result.faults.push_back(fault.reason); });
    Decoding decoding({}, bundle, codec, nullptr, nullptr);
    opened.recover(codec, [&](Bytes message) {
        result.messages.emplace_back(textOf(message));
        decoding.take(message);
    });
    decoding.finish();
    result.display = decoding.display();
    return result;
}

class RoundTrip : public testing::TestWithParam<std::string> {
protected:
    /// As the program reads it from disk.
    Value reread(const DictionaryRef& snapshot) const
    {
        EXPECT_EQ(codec.write(*snapshot, scratch / "a.kestrum"), PropertyLists::Stored::Written);
        return codec.load(scratch / "a.kestrum");
    }

    PropertyListCodec codec;
    ScratchDirectory scratch;
};

TEST_P(RoundTrip, LiveDisplaySavedAndDecodedOfflineIsTheSameDisplay)
{
    const LiveRun live(GetParam());
    const auto offline = recovered(reread(live.saved()));
    EXPECT_THAT(offline.faults, IsEmpty());
    EXPECT_EQ(offline.display, live.display());
    const auto ran = run({"--format", "json", scratch / "a.kestrum"});
    EXPECT_EQ(ran.status, 0) << ran.remarks;
}

TEST_P(RoundTrip, TheDlfStreamAloneHoldsEveryRecordToo)
{
    const LiveRun live(GetParam());
    auto contents = live.saved()->at("Data").array();
    const auto dlf = contents->back().dictionary();
    if (!dlf->contains("DLF"))
        return; // an IFX modem has no raw records
    const auto whole = recovered(live.saved());
    const auto offline = recovered(reread(snapshotOf(makeArray({dlf}))));
    EXPECT_THAT(offline.faults, IsEmpty());
    EXPECT_THAT(offline.messages, ElementsAreArray(whole.messages));
    EXPECT_EQ(offline.display, live.display());
}

INSTANTIATE_TEST_SUITE_P(Snapshots, RoundTrip, testing::Values("ifx", "gsm", "lte", "utran", "cdma"),
                         [](const auto& each) { return each.param; });

TEST(SnapshotTest, EveryMessageOfTheIntervalsComesBackAsItTravelled)
{
    const LiveRun live("gsm");
    EXPECT_THAT(recovered(live.saved()).messages, ElementsAreArray(live.messages));
}

TEST(SnapshotTest, RecordsBehindPrefixesComeBackFromAStreamWithoutFirstBytes)
{
    const auto plain = message(0xB0C1, "123456789"), prefixed = "\x81\x07"s + plain;
    const auto offline = recovered(snapshotOf(
        makeArray({makeDictionary({{"DLF", dataOf((prefixed + plain).substr(1) + (plain + prefixed).substr(1))}})})));
    EXPECT_THAT(offline.messages, testing::ElementsAre(prefixed, plain, plain, prefixed));
    EXPECT_THAT(offline.faults, IsEmpty());
}

TEST(SnapshotTest, IntervalsOfOneByteOrNoneAddNothing)
{
    const auto offline = recovered(snapshotOf(makeArray({makeDictionary({{"DisplayState", dataOf("")}})})));
    EXPECT_THAT(offline.messages, IsEmpty());
    EXPECT_THAT(offline.faults, IsEmpty());
}

struct Hostile {
    const char* name;
    Value snapshot;

    friend void PrintTo(const Hostile& shown, std::ostream* out) { *out << shown.name; }
};

class HostileSnapshot : public testing::TestWithParam<Hostile> {};

TEST_P(HostileSnapshot, IsReported)
{
    EXPECT_FALSE(recovered(GetParam().snapshot).faults.empty());
}

INSTANTIATE_TEST_SUITE_P(
    Types, HostileSnapshot,
    testing::Values(Hostile{"TimestampIsANumber", makeDictionary({{"Timestamp", 1}})},
                    Hostile{"DescriptionIsAList", makeDictionary({{"Timestamp", "t"}, {"Description", makeArray()}})},
                    Hostile{"DataIsAText", snapshotOf("text")},
                    Hostile{"DataIsADictionary", snapshotOf(makeDictionary())},
                    Hostile{"EntryIsANumber", snapshotOf(makeArray({3}))},
                    Hostile{"EntryIsAList", snapshotOf(makeArray({makeArray()}))},
                    Hostile{"DlfIsAText", snapshotOf(makeArray({makeDictionary({{"DLF", "text"}})}))},
                    Hostile{"DisplayStateIsANumber", snapshotOf(makeArray({makeDictionary({{"DisplayState", 1.5}})}))},
                    Hostile{"DisplayStateIsNoise",
                            snapshotOf(makeArray({makeDictionary({{"DisplayState", dataOf("what is this?")}})}))},
                    Hostile{"DlfIsNoise", snapshotOf(makeArray({makeDictionary({{"DLF", dataOf("what is that?")}})}))}),
    [](const auto& each) { return std::string(each.param.name); });

TEST(SnapshotTest, OfAnotherPropertyListThereIsNone)
{
    EXPECT_THROW(recovered(makeArray()), std::runtime_error);
    EXPECT_THROW(recovered(makeDictionary({{"key", "value"}})), std::runtime_error);
}

class SnapshotFile : public testing::Test {
protected:
    std::string write(const DictionaryRef& snapshot)
    {
        EXPECT_EQ(codec.write(*snapshot, scratch / "Saved.kestrum"), PropertyLists::Stored::Written);
        return scratch / "Saved.kestrum";
    }

    PropertyListCodec codec;
    ScratchDirectory scratch;
};

TEST_F(SnapshotFile, IsListedBeforeItsDisplay)
{
    const auto antennas = message(0xB0C1, std::string(7, '\0') + "\x04\0"s);
    const auto file = write(snapshotOf(makeArray(
        {makeDictionary({{"DisplayState", dataOf(antennas)}, {"Date", "noon"}, {"Description", "Snapshot (noon)"}}),
         makeDictionary({{"Description", "DLF binary (21 bytes)"}, {"DLF", dataOf(antennas.substr(1))}})})));
    EXPECT_THAT(run({file}).output, StartsWith("Snapshot " + file +
                                               "\n"
                                               "  Timestamp: 2026-11-16 06:05:42 +0000\n"
                                               "  Description: behind the station\n"
                                               "  Entry 0: Snapshot (noon); date noon; records, 22 bytes\n"
                                               "  Entry 1: DLF binary (21 bytes); date (none); DLF, 21 bytes\n"
                                               "\nServing Cell\n"));
    EXPECT_THAT(run({"--format", "json", file}).output, HasSubstr("\"timestamp\": \"2026-11-16 06:05:42 +0000\""));
    EXPECT_THAT(run({"--format", "csv", file}).output,
                StartsWith("time,code,path,value,number,unit\r\n2026-11-16T06:05:42"));
}

TEST_F(SnapshotFile, IsExtracted)
{
    const LiveRun live("lte");
    const auto file = write(live.saved());
    const auto ran = run({"--extract", scratch / "out", "--format", "json", "--stats", file});
    EXPECT_EQ(ran.status, 0);
    EXPECT_THAT(ran.remarks, HasSubstr("that are not ordinary records are only in the extracted .kcap"));
    const auto dlf = live.saved()->at("Data").array()->back().dictionary()->at("DLF");
    EXPECT_EQ(contentsOf(scratch / "out/Saved-written.dlf"), textOf(dlf.data()->bytes()));

    std::string kcaps;
    for (const auto& each : live.messages)
        kcaps += kcap(each);
    EXPECT_EQ(contentsOf(scratch / "out/Saved.kcap"), kcaps);
    const auto clean = run({"--stats", scratch / "out/Saved.dlf"});
    EXPECT_EQ(clean.status, 0) << clean.remarks;
    EXPECT_THAT(clean.remarks, HasSubstr("bytes skipped: 0"));
}

TEST_F(SnapshotFile, IsExtractedIntoNewFilesAlone)
{
    const LiveRun live("lte");
    const auto file = write(live.saved());
    std::filesystem::create_directory(scratch / "out");
    writeFile(scratch / "out/Saved.dlf", "a recording");
    writeFile(scratch / "somebody's", "here");
    std::filesystem::create_symlink(scratch / "somebody's", scratch / "out/Saved.kcap");
    const auto ran = run({"--extract", scratch / "out", file});
    EXPECT_EQ(ran.status, 1);
    EXPECT_THAT(ran.remarks, HasSubstr("existing files would be replaced (see --force): " + scratch / "out/Saved.kcap" +
                                       ", " + scratch / "out/Saved.dlf"));
    EXPECT_EQ(contentsOf(scratch / "out/Saved.dlf"), "a recording");
    EXPECT_FALSE(std::filesystem::exists(scratch / "out/Saved-written.dlf"));

    EXPECT_EQ(run({"--extract", scratch / "out", "--force", file}).status, 0);
    EXPECT_NE(contentsOf(scratch / "out/Saved.dlf"), "a recording");
    EXPECT_EQ(contentsOf(scratch / "somebody's"), "here");
    EXPECT_TRUE(std::filesystem::is_regular_file(std::filesystem::symlink_status(scratch / "out/Saved.kcap")));
}

TEST_F(SnapshotFile, OnlyTheFirstOfTwoFilesOfOneNameIsExtracted)
{
    const LiveRun live("lte");
    const auto first = write(live.saved());
    std::filesystem::create_directory(scratch / "other");
    const auto second = scratch / "other/Saved.kestrum";
    std::filesystem::copy_file(first, second);
    EXPECT_EQ(run({"--extract", scratch / "out", first, second}).status, 1);
    EXPECT_EQ(run({"--extract", scratch / "out", "--force", first, second}).status, 1) << "not each other";
}

TEST_F(SnapshotFile, CutOffIsBadInputWithItsOffset)
{
    const auto file = write(snapshotOf(makeArray()));
    writeFile(file, contentsOf(file).substr(0, 200));
    const auto ran = run({file});
    EXPECT_EQ(ran.status, 1);
    EXPECT_THAT(ran.remarks, StartsWith("kestrum-decode: " + file + ": at offset "));
}

TEST_F(SnapshotFile, CutOffGivesTheRecordsBeforeTheCut)
{
    const auto antennas = message(0xB0C1, std::string(7, '\0') + "\x04\0"s);
    const auto interval = makeDictionary({{"DisplayState", dataOf(antennas + antennas + antennas)}});
    const auto file = write(snapshotOf(makeArray({interval, interval})));
    const auto text = contentsOf(file);
    writeFile(file, text.substr(0, text.rfind("</data>") - 10));
    const auto ran = run({"--format", "json", file});
    EXPECT_EQ(ran.status, 1);
    EXPECT_THAT(ran.remarks, HasSubstr("; the remaining raw records are shown\n"));
    EXPECT_THAT(ran.output, HasSubstr("\"Num Tx Antennas\": \"4\""));
    EXPECT_THAT(ran.output, HasSubstr("\"messages\": 6"));
}

TEST_F(SnapshotFile, WithoutDataIsListedAlone)
{
    EXPECT_THAT(run({write(makeDictionary({{"Timestamp", "t"}}))}).output,
                HasSubstr("  Timestamp: t\n  Description: (none)\n"));
}

} // namespace
} // namespace kestrum::tools
