#include "ui/KestrumSaveViewController.h"

#include "doubles/ApplicationDoubles.h"
#include "harness/Scratch.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "ui/Panes.h"

#include <filesystem>
#include <fstream>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

// 2026-11-16 06:05:42 UTC, the time at which the screen is opened.
constexpr const char* kFirstPath = "/logs/KestrumSnapshot-1794809142.kestrum";

Value entry(const char* description)
{
    return makeDictionary({{"Display", makeDictionary({{"State", "Idle"}})}, {"Description", description}});
}

class KestrumSaveViewControllerTest : public testing::Test {
protected:
    void open(const Value& history)
    {
        controller = std::make_unique<KestrumSaveViewController>(doubles.applicationRoles, application, history);
        controller->viewWillAppear(true);
        view().rows.appear(true);
    }
    RecordingSaveInterface& view() { return dynamic_cast<RecordingSaveInterface&>(controller->interface()); }
    /// The keys of the file in their order.
    std::vector<std::string> keysOf(const std::string& path)
    {
        std::vector<std::string> keys;
        for (const auto& each : *doubles.propertyLists.files.at(path).dictionary())
            keys.push_back(each.key);
        return keys;
    }

    ApplicationDoubles doubles;
    CountingApplication application;
    std::unique_ptr<KestrumSaveViewController> controller;
};

TEST_F(KestrumSaveViewControllerTest, ListsEveryEntryWithACheckMark)
{
    open(makeArray({entry("Snapshot (2026-11-16 06:05:40 +0000)"), entry("DLF binary (161 bytes)")}));
    EXPECT_THAT(view().rows.texts(), ElementsAre("Snapshot (2026-11-16 06:05:40 +0000)", "DLF binary (161 bytes)"));
    for (const std::size_t row : {0u, 1u}) {
        EXPECT_EQ(view().rows.row(row).accessory, Accessory::CheckMark);
        EXPECT_EQ(view().rows.row(row).style, CellStyle::Default);
        EXPECT_EQ(view().rows.row(row).ownLabel.font(), (Font{"Helvetica", 13, false}));
        EXPECT_EQ(view().rows.reusable(row).reuseIdentifier(), "SaveHistoryContentCell");
    }
}

TEST_F(KestrumSaveViewControllerTest, FillsTheScreenBelowTheStatusBar)
{
    open(Value());
    EXPECT_EQ(view().frame, (Rect{0, 20, 320, 460}));
    EXPECT_EQ(view().rows.sizedToFit, 1);
}

TEST_F(KestrumSaveViewControllerTest, EntryWithoutADescriptionIsABlankRowStillCheckedAndSaved)
{
    open(makeArray({makeDictionary(), makeDictionary({{"Description", 7}}), "no dictionary", entry("last")}));
    EXPECT_THAT(view().rows.texts(), ElementsAre("", "", "", "last"));
    EXPECT_EQ(view().rows.row(0).accessory, Accessory::CheckMark);
    controller->savePressed();
    EXPECT_EQ(doubles.propertyLists.files.at(kFirstPath).dictionary()->at("Data").array()->size(), 4u);
}

TEST_F(KestrumSaveViewControllerTest, ReusedRowShowsItsOwnDescription)
{
    open(makeArray({entry("first"), makeDictionary(), entry("third")}));
    doubles.toolkit.record.visibleRows = 1;
    view().rows.scrollTo(1);
    EXPECT_THAT(view().rows.texts(), ElementsAre(""));
    view().rows.scrollTo(2);
    EXPECT_THAT(view().rows.texts(), ElementsAre("third"));
    EXPECT_EQ(view().rows.cellsMade, 3);
}

TEST_F(KestrumSaveViewControllerTest, FileHoldsTimestampDataAndDescriptionInThisOrder)
{
    open(makeArray({entry("first")}));
    view().field.typed = "at the north mast";
    controller->savePressed();
    EXPECT_THAT(keysOf(kFirstPath), ElementsAre("Timestamp", "Data", "Description"));
    const auto file = doubles.propertyLists.files.at(kFirstPath).dictionary();
    EXPECT_EQ(file->at("Timestamp"), "2026-11-16 06:05:42 +0000");
    EXPECT_EQ(file->at("Data"), Value(makeArray({entry("first")})));
    EXPECT_EQ(file->at("Description"), "at the north mast");
    EXPECT_THAT(doubles.toolkit.alerts, IsEmpty());
    EXPECT_THAT(doubles.log.errors(), IsEmpty());
}

TEST_F(KestrumSaveViewControllerTest, EmptyDescriptionIsSavedAsOne)
{
    open(makeArray());
    controller->savePressed();
    EXPECT_EQ(doubles.propertyLists.files.at(kFirstPath).dictionary()->at("Description"), "");
}

TEST_F(KestrumSaveViewControllerTest, NoDescriptionLeavesTimestampAndData)
{
    open(makeArray({entry("first")}));
    view().field.typed = std::nullopt;
    controller->savePressed();
    EXPECT_THAT(keysOf(kFirstPath), ElementsAre("Timestamp", "Data"));
}

TEST_F(KestrumSaveViewControllerTest, NullContentsShowNothingAndSaveTheTimestampAlone)
{
    open(Value());
    view().field.typed = "lost, for the list ends before it";
    EXPECT_EQ(view().rows.rowCount(), 0u);
    controller->savePressed();
    EXPECT_THAT(keysOf(kFirstPath), ElementsAre("Timestamp"));
}

TEST_F(KestrumSaveViewControllerTest, EmptyListShowsNothingAndSavesAnEmptyList)
{
    open(makeArray());
    EXPECT_EQ(view().rows.rowCount(), 0u);
    controller->savePressed();
    EXPECT_THAT(keysOf(kFirstPath), ElementsAre("Timestamp", "Data", "Description"));
    EXPECT_EQ(doubles.propertyLists.files.at(kFirstPath).dictionary()->at("Data"), Value(makeArray()));
}

TEST_F(KestrumSaveViewControllerTest, TimestampIsOfTheOpeningAndTheFileNameOfTheSaving)
{
    open(makeArray());
    doubles.queue.advance(90s);
    controller->savePressed();
    EXPECT_EQ(doubles.propertyLists.files.at("/logs/KestrumSnapshot-1794809232.kestrum").dictionary()->at("Timestamp"),
              "2026-11-16 06:05:42 +0000");
}

TEST_F(KestrumSaveViewControllerTest, TwoSavesWithinOneSecondLeaveTheSecond)
{
    open(makeArray());
    view().field.typed = "first";
    controller->savePressed();
    doubles.queue.advance(999ms);
    open(makeArray());
    view().field.typed = "second";
    controller->savePressed();
    EXPECT_EQ(doubles.propertyLists.files.size(), 1u);
    EXPECT_EQ(doubles.propertyLists.files.at(kFirstPath).dictionary()->at("Description"), "second");

    doubles.queue.advance(1ms);
    controller->savePressed();
    EXPECT_EQ(doubles.propertyLists.files.size(), 2u);
}

TEST_F(KestrumSaveViewControllerTest, ANameThatAnotherDisplayTookIsLeftToIt)
{
    doubles.propertyLists.taken = {kFirstPath};
    open(makeArray());
    controller->savePressed();
    EXPECT_TRUE(doubles.propertyLists.files.contains("/logs/KestrumSnapshot-1794809143.kestrum"));
    EXPECT_THAT(doubles.toolkit.alerts, IsEmpty());
}

TEST_F(KestrumSaveViewControllerTest, TriesTheNamesOfAMinute)
{
    for (const bool isOneFree : {true, false}) {
        for (int second = 0; second < (isOneFree ? 59 : 60); ++second)
            doubles.propertyLists.taken.insert(formatted("/logs/KestrumSnapshot-%d.kestrum", 1794809142 + second));
        open(makeArray());
        controller->savePressed();
        EXPECT_EQ(doubles.toolkit.alerts.empty(), isOneFree);
        doubles.queue.run();
    }
    EXPECT_THAT(doubles.propertyLists.files,
                ElementsAre(testing::Pair("/logs/KestrumSnapshot-1794809201.kestrum", testing::_)));
}

TEST_F(KestrumSaveViewControllerTest, SavesTheContentsThatItListed)
{
    const auto display = makeDictionary({{"State", "Idle"}});
    const auto first = makeDictionary({{"Display", display}, {"Description", "first"}});
    const auto history = makeArray({first});
    open(history);
    display->set("State", "Active");
    first->set("Description", "renamed");
    history->append(entry("second"));
    view().rows.reloadData();
    EXPECT_THAT(view().rows.texts(), ElementsAre("first"));
    controller->savePressed();
    EXPECT_EQ(doubles.propertyLists.files.at(kFirstPath).dictionary()->at("Data"), Value(makeArray({entry("first")})));
}

TEST_F(KestrumSaveViewControllerTest, FailedWriteIsLoggedAndReportedToTheUser)
{
    doubles.propertyLists.writable = false;
    open(makeArray());
    controller->savePressed();
    EXPECT_THAT(doubles.log.errors(),
                ElementsAre("Unable to write snapshot to /logs/KestrumSnapshot-1794809142.kestrum"));
    EXPECT_THAT(doubles.toolkit.alerts,
                ElementsAre(RecordingToolkit::Alert{"File Error", "Unable to write file to disk", "Close"}));
    doubles.queue.run();
    EXPECT_EQ(application.closed, 1);
    EXPECT_THAT(application.notices, IsEmpty());
}

TEST_F(KestrumSaveViewControllerTest, SavedSnapshotIsConfirmedWithItsPath)
{
    open(makeArray());
    controller->savePressed();
    EXPECT_THAT(application.notices, ElementsAre(std::string("Saved to ") + kFirstPath));
}

TEST_F(KestrumSaveViewControllerTest, SaveClosesAfterItsButtonHasReturned)
{
    open(makeArray());
    controller->savePressed();
    EXPECT_EQ(application.closed, 0);
    doubles.queue.run();
    EXPECT_EQ(application.closed, 1);
}

TEST_F(KestrumSaveViewControllerTest, CancelClosesLikewiseAndWritesNothing)
{
    open(makeArray({entry("first")}));
    controller->cancelPressed();
    EXPECT_EQ(application.closed, 0);
    doubles.queue.run();
    EXPECT_EQ(application.closed, 1);
    EXPECT_THAT(doubles.propertyLists.files, IsEmpty());
}

TEST_F(KestrumSaveViewControllerTest, ClosingDoesNotNeedTheScreenAnyMore)
{
    open(makeArray());
    controller->cancelPressed();
    controller.reset();
    doubles.queue.run();
    EXPECT_EQ(application.closed, 1);
}

TEST_F(KestrumSaveViewControllerTest, ReturnClosesTheKeyboardAndDoesNotSave)
{
    open(makeArray({entry("first")}));
    view().field.hasKeyboard = true;
    EXPECT_TRUE(controller->textFieldShouldReturn());
    EXPECT_FALSE(view().field.hasKeyboard);
    doubles.queue.run();
    EXPECT_THAT(doubles.propertyLists.files, IsEmpty());
    EXPECT_EQ(application.closed, 0);
}

TEST_F(KestrumSaveViewControllerTest, TouchingOutsideTheFieldClosesTheKeyboard)
{
    open(makeArray({entry("first")}));
    view().field.hasKeyboard = true;
    controller->backgroundTouched();
    EXPECT_FALSE(view().field.hasKeyboard);
    EXPECT_EQ(view().rows.row(0).accessory, Accessory::CheckMark);
}

TEST_F(KestrumSaveViewControllerTest, TouchingARowClosesTheKeyboardAndKeepsTheRow)
{
    open(makeArray({entry("first")}));
    view().field.hasKeyboard = true;
    view().rows.tap(0);
    EXPECT_FALSE(view().field.hasKeyboard);
    EXPECT_EQ(view().rows.row(0).accessory, Accessory::CheckMark);
    controller->savePressed();
    EXPECT_EQ(doubles.propertyLists.files.at(kFirstPath).dictionary()->at("Data").array()->size(), 1u);
}

/// The same with real files.
class SnapshotFile : public KestrumSaveViewControllerTest {
protected:
    void save(const std::string& directory) { save(directory, roles); }
    void save(const std::string& directory, ApplicationRoles& with)
    {
        doubles.files.logDirectory = directory;
        controller = std::make_unique<KestrumSaveViewController>(
            with, application,
            makeArray({makeDictionary(
                {{"Description", "DLF binary (3 bytes)"}, {"DLF", Data(bytesOf("abc"))}, {"Bell", "\a"}})}));
        view().field.typed = "Mast <3> & more";
        controller->savePressed();
    }

    ApplicationRoles rolesWith(PropertyLists& lists)
    {
        return {{{doubles.log, doubles.console, doubles.clock, doubles.bundle, lists},
                 doubles.queue,
                 doubles.ports,
                 doubles.telephony},
                doubles.preferences,
                doubles.files,
                doubles.toolkit};
    }

    ScratchDirectory scratch;
    PropertyListCodec codec;
    ApplicationRoles roles = rolesWith(codec);
};

TEST_F(SnapshotFile, ReadsBackFromADirectoryThatDidNotExist)
{
    save(scratch / "new/logs");
    const Value read = codec.load(scratch / "new/logs/KestrumSnapshot-1794809142.kestrum");
    EXPECT_EQ(read, Value(makeDictionary({{"Timestamp", "2026-11-16 06:05:42 +0000"},
                                          {"Data", makeArray({makeDictionary({{"Description", "DLF binary (3 bytes)"},
                                                                              {"DLF", Data(bytesOf("abc"))},
                                                                              {"Bell", "\uFFFD"}})})},
                                          {"Description", "Mast <3> & more"}})));
    EXPECT_THAT(doubles.toolkit.alerts, IsEmpty());
}

TEST_F(SnapshotFile, FailureToCreateTheDirectoryIsReported)
{
    std::ofstream(scratch / "file") << "in the way";
    save(scratch / "file/logs");
    EXPECT_EQ(doubles.toolkit.alerts.size(), 1u);
    EXPECT_THAT(doubles.log.errors(),
                ElementsAre("Unable to write snapshot to " + scratch / "file/logs/KestrumSnapshot-1794809142.kestrum"));
}

TEST_F(SnapshotFile, LargerThanWhatIsReadIsRefusedWithTheAlert)
{
    save(scratch.path());
    const auto path = scratch / "KestrumSnapshot-1794809142.kestrum";
    PropertyListCodec small(std::filesystem::file_size(path) - 1);
    ApplicationRoles withSmall = rolesWith(small);
    std::filesystem::remove(path);
    save(scratch.path(), withSmall);
    EXPECT_FALSE(std::filesystem::exists(path));
    EXPECT_THAT(doubles.toolkit.alerts,
                ElementsAre(RecordingToolkit::Alert{"File Error", "Unable to write file to disk", "Close"}));
}

TEST_F(SnapshotFile, TwoDisplaysInOneSecondSaveTwoFiles)
{
    save(scratch.path());
    PropertyListCodec another;
    ApplicationRoles second = rolesWith(another);
    KestrumSaveViewController(second, application, makeArray()).savePressed();
    EXPECT_TRUE(codec.load(scratch / "KestrumSnapshot-1794809142.kestrum"));
    EXPECT_TRUE(codec.load(scratch / "KestrumSnapshot-1794809143.kestrum"));
}

} // namespace
} // namespace kestrum
