// Standing still: all panes at one moment, while the model goes on.
#include "doubles/ApplicationDoubles.h"
#include "ui/KestrumApp.h"
#include "ui/ServedModem.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

class FreezeTest : public testing::Test {
protected:
    FreezeTest()
    {
        doubles.files.paths.insert(kInternalInstall);
        modem.serve();
        app->applicationDidFinishLaunching();
        doubles.queue.run();
    }
    void TearDown() override { EXPECT_THAT(doubles.toolkit.record.faults, IsEmpty()); }

    /// A refresh with this level, at 06:05:44 and then every 2 s.
    void show(const char* level)
    {
        showDisplay(makeDictionary({{"Serving", ServedModem::cell(level)}, {"RAT", level}}));
    }
    void showDisplay(const Value& display) { ASSERT_TRUE(modem.show(display)); }

    void open(std::string_view key)
    {
        const auto row = top().rows.find(key);
        ASSERT_TRUE(row) << key;
        top().rows.tap(*row);
    }
    void look(Look look) { navigation().look(look); }
    RecordingNavigationView& navigation() const { return *doubles.toolkit.navigation; }
    RecordingScreen& top() const { return doubles.toolkit.top(); }
    std::vector<std::string> rows() const { return top().rows.texts(); }
    std::string offered() const
    {
        const auto& frozen = navigation().frozen;
        return frozen ? (frozen->hasEarlier ? "< " : "") + frozen->text + (frozen->hasLater ? " >" : "") : "live";
    }

    ApplicationDoubles doubles;
    ServedModem modem{doubles, doubles.propertyLists};
    std::shared_ptr<KestrumApp> app = KestrumApp::make(doubles.applicationRoles);
};

TEST_F(FreezeTest, PanesStandStillUntilLiveAgain)
{
    show("-80 dBm");
    open("Serving");
    EXPECT_EQ(offered(), "live");
    look(Look::Freeze);
    EXPECT_THAT(rows(), ElementsAre("RSSI: -80 dBm", "Band"));
    EXPECT_EQ(top().status(), "Frozen since 06:05:44");
    EXPECT_FALSE(top().isLoading());
    EXPECT_EQ(offered(), "Frozen since 06:05:44");

    show("-90 dBm");
    EXPECT_THAT(rows(), ElementsAre("RSSI: -80 dBm", "Band"));
    EXPECT_EQ(top().status(), "Frozen since 06:05:44");
    EXPECT_EQ(offered(), "Frozen since 06:05:44 >");

    look(Look::Freeze);
    EXPECT_EQ(offered(), "live");
    EXPECT_THAT(rows(), ElementsAre("RSSI: -90 dBm", "Band"));
    EXPECT_EQ(top().status(), "Updated 2026-11-16 at 06:05:46");
}

TEST_F(FreezeTest, LooksBackAndForthInAllPanes)
{
    for (const char* each : {"-80 dBm", "-81 dBm", "-82 dBm"})
        show(each);
    open("Serving");
    look(Look::Freeze);
    look(Look::Earlier);
    EXPECT_THAT(rows(), ElementsAre("RSSI: -81 dBm", "Band"));
    EXPECT_EQ(top().status(), "06:05:46, frozen since 06:05:48");
    EXPECT_EQ(offered(), "< 06:05:46, frozen since 06:05:48 >");
    look(Look::Earlier);
    look(Look::Earlier); // there is no earlier one
    EXPECT_EQ(offered(), "06:05:44, frozen since 06:05:48 >");
    navigation().pressBack();
    EXPECT_THAT(rows(), ElementsAre("Serving", "RAT: -80 dBm")) << "the pane below shows the same moment";
    EXPECT_EQ(top().status(), "06:05:44, frozen since 06:05:48");
    open("Serving");
    EXPECT_THAT(rows(), ElementsAre("RSSI: -80 dBm", "Band"));

    look(Look::Later);
    look(Look::Later);
    look(Look::Later);
    EXPECT_THAT(rows(), ElementsAre("RSSI: -82 dBm", "Band"));
    EXPECT_EQ(offered(), "< Frozen since 06:05:48");
}

TEST_F(FreezeTest, EarlierFreezesFirstAndLaterDoesNothingWhileLive)
{
    show("-80 dBm");
    show("-81 dBm");
    look(Look::Later);
    EXPECT_EQ(offered(), "live");
    look(Look::Earlier);
    EXPECT_THAT(rows(), ElementsAre("Serving", "RAT: -80 dBm"));
    EXPECT_EQ(offered(), "06:05:44, frozen since 06:05:46 >");
}

TEST_F(FreezeTest, MomentsThatCameMeanwhileCanBeSeen)
{
    show("-80 dBm");
    look(Look::Freeze);
    show("-81 dBm");
    look(Look::Later);
    EXPECT_THAT(rows(), ElementsAre("Serving", "RAT: -81 dBm"));
    EXPECT_EQ(offered(), "< 06:05:46, frozen since 06:05:44");
}

TEST_F(FreezeTest, WithoutADisplayThereIsNothingToFreeze)
{
    look(Look::Freeze);
    EXPECT_EQ(offered(), "live");
    EXPECT_EQ(top().status(), "Connecting...");
    EXPECT_EQ(navigation().notice, "There is nothing to freeze yet");
}

TEST_F(FreezeTest, PaneThatIsMissingAtAMomentStaysOpenWithoutRows)
{
    showDisplay(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}}));
    show("-80 dBm");
    open("Serving");
    open("Band");
    look(Look::Earlier);
    EXPECT_THAT(rows(), IsEmpty());
    EXPECT_THAT(navigation().path, ElementsAre("Kestrum", "Serving", "Band"));
    look(Look::Later);
    EXPECT_THAT(rows(), ElementsAre("Now: 3", "Before: 8"));

    look(Look::Earlier);
    showDisplay(makeDictionary({{"RAT", "GSM"}, {"Cell", "18"}}));
    EXPECT_THAT(navigation().path, ElementsAre("Kestrum", "Serving", "Band"));
    look(Look::Freeze); // live: the path no longer exists
    EXPECT_THAT(navigation().path, ElementsAre("Kestrum"));
    EXPECT_THAT(rows(), ElementsAre("RAT: GSM", "Cell: 18"));
}

TEST_F(FreezeTest, HistoryGoesOnMeanwhile)
{
    show("-80 dBm");
    look(Look::Freeze);
    show("-81 dBm");
    show("-82 dBm");
    look(Look::Freeze);
    top().pressSave();
    EXPECT_THAT(navigation().presented->rows.texts(),
                ElementsAre("Snapshot (2026-11-16 06:05:44 +0000)", "Snapshot (2026-11-16 06:05:46 +0000)",
                            "Snapshot (2026-11-16 06:05:48 +0000)"));
}

TEST_F(FreezeTest, SaveWritesTheMomentShownAndThoseBeforeIt)
{
    for (const char* each : {"-80 dBm", "-81 dBm", "-82 dBm"})
        show(each);
    look(Look::Earlier);
    show("-83 dBm");
    top().pressSave();
    EXPECT_THAT(navigation().presented->rows.texts(),
                ElementsAre("Snapshot (2026-11-16 06:05:44 +0000)", "Snapshot (2026-11-16 06:05:46 +0000)"));
    look(Look::Later); // not under the save screen
    navigation().presented->owner.savePressed();
    doubles.queue.run();
    EXPECT_EQ(top().status(), "06:05:46, frozen since 06:05:48");
    ASSERT_EQ(doubles.propertyLists.files.size(), 1u);
    const auto snapshot = doubles.propertyLists.files.begin()->second.dictionary();
    const Value last = snapshot->at("Data").array()->back().dictionary()->at("Display");
    EXPECT_EQ(last.dictionary()->at("RAT"), "-81 dBm");
}

TEST_F(FreezeTest, ChannelDiesAndComesBackMeanwhile)
{
    show("-80 dBm");
    look(Look::Freeze);
    modem.kill();
    doubles.queue.advance(2s);
    EXPECT_EQ(top().status(), "Frozen since 06:05:44");
    EXPECT_TRUE(top().isLoading()) << "the connection is missed all the same";
    modem.serve();
    doubles.queue.advance(5s);
    EXPECT_FALSE(top().isLoading());
    show("-81 dBm");
    EXPECT_THAT(rows(), ElementsAre("Serving", "RAT: -80 dBm"));
    EXPECT_EQ(top().status(), "Frozen since 06:05:44");
    look(Look::Freeze);
    EXPECT_THAT(rows(), ElementsAre("Serving", "RAT: -81 dBm"));
}

TEST_F(FreezeTest, DisplayOfAnotherTechnologyWaitsUntilLive)
{
    show("-80 dBm");
    open("Serving");
    look(Look::Freeze);
    app->displayReplaced();
    EXPECT_THAT(navigation().path, ElementsAre("Kestrum", "Serving"));
    EXPECT_THAT(rows(), ElementsAre("RSSI: -80 dBm", "Band"));

    look(Look::Freeze);
    EXPECT_THAT(navigation().path, ElementsAre("Kestrum"));
    EXPECT_THAT(rows(), IsEmpty()) << "nothing of the old display as if it were current";

    look(Look::Freeze);
    EXPECT_EQ(offered(), "live") << "an empty display does not stand still";
    look(Look::Earlier);
    EXPECT_THAT(rows(), ElementsAre("Serving", "RAT: -80 dBm"));
    EXPECT_EQ(top().status(), "Frozen since 06:05:44");
}

TEST_F(FreezeTest, OtherDisplayThatHasDataIsShownFromTheRoot)
{
    show("-80 dBm");
    open("Serving");
    look(Look::Freeze);
    app->displayReplaced();
    show("-90 dBm");
    look(Look::Freeze);
    EXPECT_THAT(navigation().path, ElementsAre("Kestrum"));
    EXPECT_THAT(rows(), ElementsAre("Serving", "RAT: -90 dBm"));
}

TEST_F(FreezeTest, TimeThatJumpsBackIsShownAsItWas)
{
    show("-80 dBm");
    doubles.clock.date -= 1h;
    doubles.queue.run();
    app->updateViewControllerFromModel();
    show("-81 dBm");
    look(Look::Freeze);
    const std::string since = top().status();
    look(Look::Earlier);
    EXPECT_THAT(rows(), ElementsAre("Serving", "RAT: -80 dBm"));
    EXPECT_NE(top().status(), since);
    EXPECT_EQ(top().status().substr(0, 8), "06:05:44");
}

TEST_F(FreezeTest, MomentStaysAfterItHasLeftTheLastFifteenMinutes)
{
    show("-80 dBm");
    look(Look::Freeze);
    for (int i = 0; i < 460; ++i)
        show(i % 2 == 0 ? "-81 dBm" : "-82 dBm");
    EXPECT_THAT(rows(), ElementsAre("Serving", "RAT: -80 dBm"));
    EXPECT_EQ(offered(), "Frozen since 06:05:44 >");
    look(Look::Later);
    EXPECT_EQ(offered(), "06:06:06, frozen since 06:05:44 >") << "the oldest that is left";
}

TEST_F(FreezeTest, AfterTerminationItIsHarmless)
{
    show("-80 dBm");
    look(Look::Freeze);
    app->applicationWillTerminate();
    look(Look::Earlier);
    look(Look::Freeze);
    look(Look::Freeze);
    EXPECT_THAT(rows(), ElementsAre("Serving", "RAT: -80 dBm"));
}

} // namespace
} // namespace kestrum
