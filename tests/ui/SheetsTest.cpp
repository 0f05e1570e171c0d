#include "doubles/ApplicationDoubles.h"
#include "ui/KestrumApp.h"
#include "ui/ServedModem.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

/// The application with doubles of its roles, on an IFX modem.
class SheetsTest : public testing::Test {
protected:
    SheetsTest()
    {
        modem.serve();
        app->applicationDidFinishLaunching();
        doubles.queue.run();
    }
    void TearDown() override { EXPECT_THAT(doubles.toolkit.record.faults, IsEmpty()); }

    /// At least two neighbours: a dictionary with one entry is a wrapper of the modem's.
    static Value display(std::initializer_list<const char*> levels)
    {
        auto list = makeDictionary();
        for (const char* level : levels) {
            const auto index = list->size();
            list->set(std::to_string(index),
                      makeDictionary({{"ARFCN", std::to_string(31 + index)}, {"BSIC", "7"}, {"RSSI", level}}));
        }
        return makeDictionary(
            {{"Serving Cell", makeDictionary({{"ARFCN", "60"}, {"RSSI", "-53 dBm"}})}, {"Neighbor Cells", list}});
    }
    void show(std::initializer_list<const char*> levels) { ASSERT_TRUE(modem.show(display(levels))); }
    void openPane(std::string_view key)
    {
        doubles.toolkit.top().rows.tap(doubles.toolkit.top().rows.find(key).value());
    }
    RecordingNavigationView& view() { return *doubles.toolkit.navigation; }
    /// The levels of the sheet's table, from the top down.
    std::vector<std::string> levels()
    {
        std::vector<std::string> all;
        for (const auto& row : view().sheet->contents.parts.at(0).table.rows)
            all.push_back(row.cells.at(2).text);
        return all;
    }

    ApplicationDoubles doubles;
    ServedModem modem{doubles, doubles.propertyLists};
    std::shared_ptr<KestrumApp> app = KestrumApp::make(doubles.applicationRoles);
};

TEST_F(SheetsTest, TableIsOfferedInPanesOfListsAndTheOverviewInTheRootPane)
{
    using enum SheetKind;
    EXPECT_FALSE(view().isOffered(Overview)) << "there is no data yet";
    show({"-76 dBm", "-80 dBm"});
    EXPECT_TRUE(view().isOffered(Overview));
    EXPECT_FALSE(view().isOffered(Glance));
    openPane("Neighbor Cells");
    EXPECT_FALSE(view().isOffered(Overview));
    EXPECT_TRUE(view().isOffered(Glance));
    openPane("0");
    EXPECT_FALSE(view().isOffered(Glance));
    view().press(Glance);
    EXPECT_FALSE(view().sheet);
}

TEST_F(SheetsTest, OpensTheListWithTitleStatusAndRows)
{
    show({"-76 dBm", "-60 dBm"});
    openPane("Neighbor Cells");
    view().press(SheetKind::Glance);
    ASSERT_TRUE(view().sheet);
    EXPECT_EQ(view().sheet->contents.title, "Neighbor Cells");
    EXPECT_EQ(view().sheet->contents.status, app->updateMessage());
    EXPECT_THAT(levels(), ElementsAre("-53", "-60", "-76"));
}

TEST_F(SheetsTest, FollowsEachRefreshAndTheConnection)
{
    show({"-76 dBm", "-80 dBm"});
    openPane("Neighbor Cells");
    view().press(SheetKind::Glance);
    show({"-75 dBm", "-80 dBm", "-99 dBm"});
    EXPECT_THAT(levels(), ElementsAre("-53", "-75", "-80", "-99"));
    modem.kill();
    doubles.queue.advance(2s);
    EXPECT_EQ(view().sheet->contents.status, "Connecting...");
    EXPECT_THAT(levels(), ElementsAre("-53", "-75", "-80", "-99")) << "what was seen last stays";
}

TEST_F(SheetsTest, SortsByAColumnAtOnce)
{
    show({"-76 dBm", "-60 dBm"});
    openPane("Neighbor Cells");
    view().press(SheetKind::Glance);
    view().sheet->owner.columnChosen(2);
    EXPECT_THAT(levels(), ElementsAre("-53", "-76", "-60"));
    view().sheet->owner.columnChosen(0);
    EXPECT_THAT(levels(), ElementsAre("-53", "-76", "-60"));
}

TEST_F(SheetsTest, LeavesThePanesAsTheyWere)
{
    show({"-76 dBm", "-80 dBm"});
    openPane("Neighbor Cells");
    const auto path = view().path;
    const auto reloads = doubles.toolkit.top().rows.reloads;
    view().press(SheetKind::Glance);
    EXPECT_FALSE(view().isOffered(SheetKind::Glance)) << "one at a time";
    view().sheet->owner.sheetLeft();
    EXPECT_FALSE(view().sheet);
    EXPECT_EQ(view().path, path);
    EXPECT_EQ(doubles.toolkit.top().rows.reloads, reloads);
    view().press(SheetKind::Glance);
    EXPECT_TRUE(view().sheet);
}

TEST_F(SheetsTest, ClosesWhenItsListIsGone)
{
    show({"-76 dBm", "-80 dBm"});
    openPane("Neighbor Cells");
    view().press(SheetKind::Glance);
    ASSERT_TRUE(modem.show(makeDictionary({{"a", "b"}, {"c", "d"}})));
    EXPECT_FALSE(view().sheet);
    EXPECT_THAT(view().path, ElementsAre("Kestrum"));
}

TEST_F(SheetsTest, ClosesWhenTheModemRunsAnotherTechnology)
{
    show({"-76 dBm", "-80 dBm"});
    view().press(SheetKind::Overview);
    ASSERT_TRUE(view().sheet);
    app->displayReplaced();
    EXPECT_FALSE(view().sheet);
}

TEST_F(SheetsTest, OverviewHasTheServingCellAndTheBestNeighbours)
{
    show({"-76 dBm", "-60 dBm"});
    view().press(SheetKind::Overview);
    const auto& contents = view().sheet->contents;
    EXPECT_EQ(contents.title, "Overview");
    EXPECT_FALSE(contents.canSort);
    ASSERT_EQ(contents.parts.size(), 2u);
    EXPECT_EQ(contents.parts[0].facts.at(1), (SheetFact{"RSSI", {"-53 dBm", 57.0 / 62, "excellent"}}));
    EXPECT_EQ(contents.parts[1].caption, "Neighbor Cells");
}

TEST_F(SheetsTest, EventsAndCellsAreOfferedInEveryPaneOnceTheTechnologyIsKnown)
{
    using enum SheetKind;
    EXPECT_TRUE(view().isOffered(Events));
    EXPECT_TRUE(view().isOffered(Cells));
    show({"-76 dBm", "-80 dBm"});
    openPane("Neighbor Cells");
    openPane("0");
    EXPECT_TRUE(view().isOffered(Events));
    view().press(Cells);
    ASSERT_TRUE(view().sheet);
    EXPECT_EQ(view().sheet->contents.title, "Cells");
    EXPECT_FALSE(view().isOffered(Events)) << "one at a time";
}

TEST_F(SheetsTest, NothingIsOfferedBeforeTheTechnologyIsKnown)
{
    ApplicationDoubles others;
    const auto unconnected = KestrumApp::make(others.applicationRoles);
    unconnected->applicationDidFinishLaunching();
    for (const auto& command : kSheetCommands)
        EXPECT_FALSE(others.toolkit.navigation->isOffered(command.kind, 0)) << command.name;
}

TEST_F(SheetsTest, ATrendIsOfferedOfAValueAndAMeaningOfEachRow)
{
    using enum SheetKind;
    show({"-76 dBm", "-80 dBm"});
    EXPECT_FALSE(view().isOffered(Trend, 0)) << "it opens a pane";
    EXPECT_TRUE(view().isOffered(Meaning, 0));
    EXPECT_FALSE(view().isOffered(Trend)) << "no row is chosen";
    EXPECT_FALSE(view().isOffered(Meaning));
    openPane("Serving Cell");
    EXPECT_TRUE(view().isOffered(Trend, 1));
    EXPECT_TRUE(view().isOffered(Meaning, 1));
    EXPECT_FALSE(view().isOffered(Trend, 2)) << "there are two rows";
    EXPECT_FALSE(view().isOffered(Meaning, 2));
}

TEST_F(SheetsTest, ATrendFollowsEachRefreshAndTheUser)
{
    show({"-76 dBm", "-60 dBm"});
    openPane("Neighbor Cells");
    openPane("1");
    view().press(SheetKind::Trend, 2);
    ASSERT_TRUE(view().sheet);
    const auto& contents = view().sheet->contents;
    EXPECT_EQ(contents.title, "RSSI (BSIC 7, ARFCN 32)");
    show({"-76 dBm", "-59 dBm"});
    EXPECT_EQ(contents.parts.at(0).plot->points.size(), 2u);
    EXPECT_EQ(contents.parts[0].facts.at(0).value.text, "-59 dBm");
    const auto changes = view().sheet->changes;
    view().sheet->owner.cursorMoved(0);
    EXPECT_EQ(contents.parts[0].plot->cursor, 0u);
    view().sheet->owner.rangeChosen(1);
    EXPECT_EQ(contents.parts[0].plot->range, 1u);
    EXPECT_EQ(view().sheet->changes, changes + 2);
    EXPECT_EQ(contents.status, app->updateMessage());
}

TEST_F(SheetsTest, ATrendEndsWhereThePanesStandStill)
{
    show({"-76 dBm", "-60 dBm"});
    openPane("Serving Cell");
    view().look(Look::Freeze);
    show({"-76 dBm", "-60 dBm"});
    view().press(SheetKind::Trend, 1);
    ASSERT_TRUE(view().sheet);
    EXPECT_EQ(view().sheet->contents.parts.at(0).plot->points.size(), 1u);
}

TEST_F(SheetsTest, AMeaningFollowsItsValue)
{
    show({"-76 dBm", "-60 dBm"});
    openPane("Neighbor Cells");
    openPane("1");
    view().press(SheetKind::Meaning, 2);
    ASSERT_TRUE(view().sheet);
    EXPECT_EQ(view().sheet->contents.title, "RSSI");
    show({"-76 dBm", "-59 dBm"});
    EXPECT_EQ(view().sheet->contents.parts.at(0).facts.at(0).value.text, "-59 dBm");
}

TEST_F(SheetsTest, EventsComeWhileTheirSheetIsOpen)
{
    show({"-76 dBm", "-60 dBm"});
    view().press(SheetKind::Events);
    ASSERT_TRUE(view().sheet);
    const auto rows = [this] {
        const auto& parts = view().sheet->contents.parts;
        return parts.empty() ? 0 : parts[0].table.rows.size();
    };
    const auto before = rows();
    modem.kill();
    doubles.queue.advance(2s);
    modem.serve();
    doubles.queue.advance(10s);
    show({"-76 dBm", "-60 dBm"});
    EXPECT_GE(rows(), before + 2);
}

TEST_F(SheetsTest, AnOpenSheetEndsWithTheApplication)
{
    show({"-76 dBm", "-80 dBm"});
    view().press(SheetKind::Overview);
    app->applicationWillTerminate();
    app.reset();
    EXPECT_EQ(doubles.toolkit.record.windows, 0);
}

} // namespace
} // namespace kestrum
