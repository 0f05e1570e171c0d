#include "ui/KestrumApp.h"

#include "doubles/ApplicationDoubles.h"
#include "ui/ConnectionHint.h"
#include "ui/ServedModem.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

Value cell(const char* rssi)
{
    return ServedModem::cell(rssi);
}

/// The application with doubles of its roles.
class KestrumAppTest : public testing::Test {
protected:
    void TearDown() override { EXPECT_THAT(doubles.toolkit.record.faults, IsEmpty()); }

    void launch()
    {
        app = KestrumApp::make(doubles.applicationRoles);
        app->applicationDidFinishLaunching();
    }
    void launchConnected()
    {
        modem.serve();
        launch();
        doubles.queue.run();
    }
    void show(const Value& display) { ASSERT_TRUE(modem.show(display)); }
    void showCells() { show(makeDictionary({{"Serving", cell("-80 dBm")}, {"Neighbor", cell("-95 dBm")}})); }
    void open(std::string_view key)
    {
        const auto row = top().rows.find(key);
        ASSERT_TRUE(row) << key;
        top().rows.tap(*row);
    }

    RecordingScreen& top() const { return doubles.toolkit.top(); }
    const std::vector<std::string>& path() const { return doubles.toolkit.navigation->path; }

    ApplicationDoubles doubles;
    ServedModem modem{doubles, doubles.propertyLists};
    std::shared_ptr<KestrumApp> app;
};

// Launch

TEST_F(KestrumAppTest, FirstScreenIsUpBeforeAnythingIsOpened)
{
    modem.serve();
    launch();
    EXPECT_TRUE(doubles.toolkit.window->visible);
    EXPECT_EQ(doubles.toolkit.windowFrame, (Rect{0, 0, 320, 480}));
    EXPECT_EQ(doubles.toolkit.window->root, doubles.toolkit.navigation);
    EXPECT_EQ(top().title(), "Kestrum");
    EXPECT_EQ(top().rows.rowCount(), 0u);
    EXPECT_THAT(doubles.telephony.channelsAsked, IsEmpty());

    doubles.queue.run();
    EXPECT_EQ(doubles.telephony.channelsAsked.size(), 1u);
}

TEST_F(KestrumAppTest, VeryFirstStatusIsConnectingWithoutDots)
{
    launch();
    EXPECT_EQ(top().status(), "Connecting");
    EXPECT_TRUE(top().isLoading());
    EXPECT_EQ(app->updateMessage(), "Connecting...");

    doubles.queue.run(); // the first attempt, without a service
    EXPECT_EQ(top().status(), "Connecting...");
    EXPECT_TRUE(top().isLoading());
}

TEST_F(KestrumAppTest, MonitoringStartsOnlyWhileTheApplicationHasAModel)
{
    modem.serve();
    launch();
    app->applicationWillTerminate();
    doubles.queue.advance(10s);
    EXPECT_THAT(doubles.telephony.channelsAsked, IsEmpty());
}

// Status

TEST_F(KestrumAppTest, StatusFollowsConnectDataLossAndReconnect)
{
    launchConnected();
    EXPECT_EQ(top().status(), "Connecting...") << "connected, before the first data";
    EXPECT_FALSE(top().isLoading());

    showCells();
    EXPECT_EQ(top().status(), "Updated 2026-11-16 at 06:05:44");
    EXPECT_FALSE(top().isLoading());

    doubles.queue.advance(2s);
    EXPECT_EQ(top().status(), "Updated 2026-11-16 at 06:05:44") << "a refresh without new data";

    modem.kill();
    doubles.queue.advance(2s);
    EXPECT_EQ(top().status(), "Connecting...");
    EXPECT_TRUE(top().isLoading());
    EXPECT_THAT(top().rows.texts(), ElementsAre("Serving", "Neighbor")) << "what was seen last stays";

    modem.serve();
    doubles.queue.advance(5s);
    EXPECT_EQ(top().status(), "Updated 2026-11-16 at 06:05:44") << "the old text until new data comes";
    EXPECT_FALSE(top().isLoading());

    showCells();
    EXPECT_EQ(top().status(), "Updated 2026-11-16 at 06:05:55");
}

TEST_F(KestrumAppTest, UpdateTimeIsShownInTheDevicesZone)
{
    doubles.clock.zone = {std::chrono::hours(2), false};
    launchConnected();
    showCells();
    EXPECT_EQ(top().status(), "Updated 2026-11-16 at 08:05:44");
}

TEST_F(KestrumAppTest, UpdateMessageIsShownWhileThereIsNoConnection)
{
    launchConnected();
    showCells();
    modem.kill();
    doubles.queue.advance(2s);
    app->updateViewControllerFromModel();
    EXPECT_EQ(app->updateMessage(), "Updated 2026-11-16 at 06:05:44");
    EXPECT_EQ(top().status(), "Connecting...");
}

TEST_F(KestrumAppTest, PaneThatIsOpenedOrRevealedShowsTheStatusOfTheMoment)
{
    launchConnected();
    showCells();
    open("Serving");
    EXPECT_EQ(top().status(), "Updated 2026-11-16 at 06:05:44");

    modem.kill();
    doubles.queue.advance(2s);
    EXPECT_EQ(top().status(), "Connecting...");
    doubles.toolkit.navigation->pressBack();
    EXPECT_EQ(top().title(), "Kestrum");
    EXPECT_EQ(top().status(), "Connecting...");
    EXPECT_TRUE(top().isLoading());
}

// A connection that cannot be made

TEST_F(KestrumAppTest, RootPaneSaysAfterTenSecondsWhatItWaitsFor)
{
    launch();
    doubles.queue.advance(9999ms);
    EXPECT_EQ(top().hint, "");
    doubles.queue.advance(1ms);
    EXPECT_EQ(top().hint, connectionHint());
    EXPECT_EQ(top().status(), "Connecting...") << "the status is as it was";
    EXPECT_TRUE(top().isLoading());
    EXPECT_EQ(top().title(), "Kestrum");

    modem.serve();
    doubles.queue.advance(5s);
    EXPECT_FALSE(top().isLoading());
    EXPECT_EQ(top().hint, "");
}

TEST_F(KestrumAppTest, ConnectionThatComesInTimeLeavesNoHint)
{
    launch();
    doubles.queue.advance(7s);
    modem.serve();
    doubles.queue.advance(20s);
    EXPECT_EQ(top().hint, "");
}

TEST_F(KestrumAppTest, LostConnectionStartsAnotherWaitOfTenSeconds)
{
    launchConnected();
    doubles.queue.advance(60s);
    modem.kill();
    doubles.queue.advance(2s); // the refresh that reads it
    doubles.queue.advance(9999ms);
    EXPECT_EQ(top().hint, "");
    doubles.queue.advance(1ms);
    EXPECT_EQ(top().hint, connectionHint());
}

TEST_F(KestrumAppTest, RootPaneKeepsTheHintWhileAnotherPaneIsOpen)
{
    launchConnected();
    showCells();
    open("Serving");
    modem.kill();
    doubles.queue.advance(20s);
    EXPECT_EQ(top().hint, "");
    doubles.toolkit.navigation->pressBack();
    EXPECT_EQ(top().hint, connectionHint());
}

TEST_F(KestrumAppTest, EndedApplicationWaitsForNothing)
{
    launch();
    doubles.queue.run();
    app->applicationWillTerminate();
    app->updateStatus();
    EXPECT_EQ(doubles.queue.timers(), 0u);
}

TEST_F(KestrumAppTest, HintFollowsTheReasonThatIsKnown)
{
    doubles.telephony.reachable = false;
    doubles.telephony.why = "No telephony service can be reached in /run.";
    launch();
    doubles.queue.advance(10s);
    EXPECT_EQ(top().hint, connectionHint(Problem{"No telephony service can be reached in /run."}));
    doubles.telephony.why = "The telephony service has no channel left for this display.";
    doubles.queue.advance(10s);
    EXPECT_EQ(top().hint, connectionHint(Problem{"The telephony service has no channel left for this display."}));
}

TEST_F(KestrumAppTest, LostMessagesAreReportedInALineThatDisappears)
{
    using namespace std::string_view_literals;
    launchConnected();
    showCells();
    doubles.ports.send("org.kestrum.vox.baseband-state-report.log", 1, "\x11\0\0\0\0\0\0\0"sv);
    doubles.queue.run();
    EXPECT_EQ(doubles.toolkit.navigation->notice,
              "The telephony service dropped 17 messages: this display was too slow for them");
    doubles.queue.advance(8s);
    EXPECT_EQ(doubles.toolkit.navigation->notice, "");
}

TEST(ConnectionHintTest, SaysWhatIsMissingAndHowToStartIt)
{
    EXPECT_EQ(connectionHint(), "Waiting for the telephony service.\nTo start a simulated one:\nvoxd --scenario lte");
    EXPECT_EQ(connectionHint(Problem{"It belongs to another user."}),
              "Waiting for the telephony service.\nIt belongs to another user.\n"
              "To start a simulated one:\nvoxd --scenario lte");
}

// Notices

TEST_F(KestrumAppTest, NoticeDisappearsAfterItsTime)
{
    launch();
    const auto timers = doubles.queue.timers();
    app->showNotice("first");
    doubles.queue.advance(5s);
    app->showNotice("second");
    doubles.queue.advance(7999ms);
    EXPECT_EQ(doubles.toolkit.navigation->notice, "second") << "each has its own time";
    doubles.queue.advance(1ms);
    EXPECT_EQ(doubles.toolkit.navigation->notice, "");
    EXPECT_EQ(doubles.queue.timers(), timers);
}

TEST_F(KestrumAppTest, ApplicationCanEndWhileANoticeIsShown)
{
    launch();
    app->showNotice("first");
    app->applicationWillTerminate();
    EXPECT_EQ(doubles.queue.timers(), 0u);
    app.reset();
    doubles.queue.advance(10s);
    EXPECT_EQ(doubles.toolkit.record.windows, 0);
}

// Panes

TEST_F(KestrumAppTest, EveryPaneFollowsItsPath)
{
    launchConnected();
    showCells();
    open("Serving");
    open("Band");
    const auto band = makeDictionary({{"Now", "20"}, {"Before", "3"}});
    show(makeDictionary(
        {{"Detected", cell("-101 dBm")}, {"Serving", makeDictionary({{"RSSI", "-70 dBm"}, {"Band", band}})}}));
    EXPECT_THAT(path(), ElementsAre("Kestrum", "Serving", "Band"));
    EXPECT_THAT(top().rows.texts(), ElementsAre("Now: 20", "Before: 3"));
    doubles.toolkit.navigation->pressBack();
    EXPECT_THAT(top().rows.texts(), ElementsAre("RSSI: -70 dBm", "Band"));
    doubles.toolkit.navigation->pressBack();
    EXPECT_THAT(top().rows.texts(), ElementsAre("Detected", "Serving"));
}

TEST_F(KestrumAppTest, MiddlePaneWithARemovedPathPopsToTheReloadedRoot)
{
    launchConnected();
    showCells();
    open("Serving");
    open("Band");
    show(makeDictionary({{"Neighbor", cell("-90 dBm")}, {"Detected", cell("-101 dBm")}}));
    EXPECT_THAT(path(), ElementsAre("Kestrum"));
    EXPECT_EQ(doubles.toolkit.navigation->transitions.back(), std::pair(Transition::Pop, true));
    EXPECT_THAT(top().rows.texts(), ElementsAre("Neighbor", "Detected"));
    EXPECT_EQ(top().status(), "Updated 2026-11-16 at 06:05:46");
}

TEST_F(KestrumAppTest, TopPaneWithARemovedPathPopsAlone)
{
    launchConnected();
    showCells();
    open("Serving");
    open("Band");
    show(makeDictionary(
        {{"Neighbor", cell("-90 dBm")}, {"Serving", makeDictionary({{"RSSI", "-70 dBm"}, {"PLMN", cell("")}})}}));
    EXPECT_THAT(path(), ElementsAre("Kestrum", "Serving"));
    EXPECT_THAT(top().rows.texts(), ElementsAre("RSSI: -70 dBm", "PLMN"));
}

TEST_F(KestrumAppTest, RowThatTurnsFromInnerToLeafKeepsItsKeyOnlyCell)
{
    launchConnected();
    showCells();
    show(makeDictionary({{"Serving", "none"}, {"Neighbor", cell("-90 dBm")}}));
    EXPECT_THAT(top().rows.texts(), ElementsAre("Serving", "Neighbor"));
    EXPECT_EQ(top().rows.row(0).accessory, Accessory::None);
}

TEST_F(KestrumAppTest, PaneWhoseNodeBecameALeafStaysWithoutRows)
{
    launchConnected();
    showCells();
    open("Serving");
    show(makeDictionary({{"Serving", "none"}, {"State", "Idle"}}));
    EXPECT_THAT(path(), ElementsAre("Kestrum", "Serving"));
    EXPECT_THAT(top().rows.texts(), IsEmpty());

    showCells();
    EXPECT_THAT(top().rows.texts(), ElementsAre("RSSI: -80 dBm", "Band"));
}

TEST_F(KestrumAppTest, RowThatARefreshRemovedTakesNoTap)
{
    launchConnected();
    showCells();
    show(makeDictionary({{"Serving", cell("-80 dBm")}}));
    top().rows.tap(1);
    EXPECT_THAT(path(), ElementsAre("Kestrum"));
}

TEST_F(KestrumAppTest, WithoutAGeneratorTheRootTitleIsKestrumAndThereAreNoRows)
{
    launch();
    doubles.queue.run();
    app->updateViewControllerFromModel();
    EXPECT_EQ(top().title(), "Kestrum");
    EXPECT_EQ(top().rows.rowCount(), 0u);
    EXPECT_EQ(top().rows.reloads, 1);
}

TEST_F(KestrumAppTest, RefreshWithoutNewDataTouchesNoPane)
{
    launchConnected();
    showCells();
    const int reloads = top().rows.reloads;
    doubles.queue.advance(20s);
    EXPECT_EQ(top().rows.reloads, reloads);
}

TEST_F(KestrumAppTest, AnotherTechnologysDisplayClosesWhatWasOpenInTheOldOne)
{
    launchConnected();
    showCells();
    open("Serving");
    modem.kill();
    doubles.queue.advance(2s);
    modem.serve("kVoxLogChannelTechnology_Zephra_LTE");
    doubles.queue.advance(5s);
    EXPECT_THAT(path(), ElementsAre("Kestrum"));
    EXPECT_THAT(top().rows.texts(), IsEmpty()) << "nothing of the old display looks current";
    EXPECT_FALSE(top().isLoading());
}

// Save

TEST_F(KestrumAppTest, WithoutTheInternalInstallMarkerNoPaneOffersSave)
{
    launchConnected();
    EXPECT_FALSE(app->allowSaveButton());
    showCells();
    EXPECT_EQ(top().toolbar.size(), 3u);
    open("Serving");
    EXPECT_EQ(top().toolbar.size(), 3u);
}

TEST_F(KestrumAppTest, WithTheInternalInstallMarkerEveryPaneOffersSave)
{
    doubles.files.paths.insert(kInternalInstall);
    launchConnected();
    EXPECT_TRUE(app->allowSaveButton());
    EXPECT_NE(top().saveButton(), nullptr);
    showCells();
    open("Serving");
    EXPECT_NE(top().saveButton(), nullptr);
}

class KestrumAppSaveTest : public KestrumAppTest {
protected:
    KestrumAppSaveTest() { doubles.files.paths.insert(kInternalInstall); }

    RecordingNavigationView& navigation() { return *doubles.toolkit.navigation; }
    const Value& file(const char* path) { return doubles.propertyLists.files.at(path); }
};

TEST_F(KestrumAppSaveTest, HeldSaveButtonSurvivesARefresh)
{
    launchConnected();
    showCells();
    const auto held = top().saveButton();
    showCells();
    EXPECT_EQ(top().status(), "Updated 2026-11-16 at 06:05:46");
    EXPECT_EQ(top().saveButton(), held);
    std::get<SaveItem>(*held).action();
    EXPECT_NE(navigation().presented, nullptr);
}

TEST_F(KestrumAppSaveTest, SavePressedTwicePresentsOneScreen)
{
    launchConnected();
    top().pressSave();
    top().pressSave();
    EXPECT_EQ(navigation().presentations, 1);
    EXPECT_EQ(navigation().presentedAnimated, true);
    EXPECT_EQ(app->saveViewController(), nullptr) << "the property is none of the screen's business";
}

TEST_F(KestrumAppSaveTest, RowUnderTheSaveScreenOpensNothing)
{
    launchConnected();
    showCells();
    top().pressSave();
    open("Serving");
    EXPECT_THAT(path(), ElementsAre("Kestrum"));
    navigation().presented->owner.cancelPressed();
    doubles.queue.run();
    open("Serving");
    EXPECT_THAT(path(), ElementsAre("Kestrum", "Serving"));
}

TEST_F(KestrumAppSaveTest, ListsAndWritesTheHistoryOfTheMoment)
{
    launchConnected();
    showCells();
    showCells();
    top().pressSave();
    EXPECT_THAT(navigation().presented->rows.texts(),
                ElementsAre("Snapshot (2026-11-16 06:05:44 +0000)", "Snapshot (2026-11-16 06:05:46 +0000)"));
    showCells();
    EXPECT_EQ(navigation().presented->rows.rowCount(), 2u) << "data that comes meanwhile is not added";

    navigation().presented->owner.savePressed();
    EXPECT_NE(navigation().presented, nullptr) << "the screen is closed after its button has returned";
    doubles.queue.run();
    EXPECT_EQ(navigation().presented, nullptr);
    EXPECT_EQ(navigation().notice, "Saved to /logs/KestrumSnapshot-1794809148.kestrum");

    // 2026-11-16 06:05:48 UTC
    const auto snapshot = file("/logs/KestrumSnapshot-1794809148.kestrum").dictionary();
    ASSERT_NE(snapshot, nullptr);
    EXPECT_EQ(snapshot->at("Timestamp"), "2026-11-16 06:05:46 +0000");
    EXPECT_EQ(snapshot->at("Data").array()->size(), 2u);
}

TEST_F(KestrumAppSaveTest, CanBeOpenedAgainAfterItWasClosed)
{
    launchConnected();
    top().pressSave();
    navigation().presented->owner.cancelPressed();
    doubles.queue.run();
    top().pressSave();
    EXPECT_EQ(navigation().presentations, 2);
    EXPECT_NE(navigation().presented, nullptr);
    EXPECT_THAT(doubles.propertyLists.files, IsEmpty());
}

TEST_F(KestrumAppSaveTest, CancelPressedTwiceClosesOnce)
{
    launchConnected();
    top().pressSave();
    navigation().presented->owner.cancelPressed();
    navigation().presented->owner.cancelPressed();
    doubles.queue.run();
    EXPECT_EQ(navigation().presented, nullptr);
    app->closeSaveView();
    EXPECT_EQ(navigation().presentations, 1);
}

TEST_F(KestrumAppSaveTest, FailedWriteClosesTheScreenBehindItsAlert)
{
    launchConnected();
    doubles.propertyLists.writable = false;
    top().pressSave();
    navigation().presented->owner.savePressed();
    doubles.queue.run();
    EXPECT_EQ(navigation().presented, nullptr);
    EXPECT_THAT(doubles.toolkit.alerts,
                ElementsAre(RecordingToolkit::Alert{"File Error", "Unable to write file to disk", "Close"}));
}

TEST_F(KestrumAppSaveTest, WithoutAGeneratorOnlyTheTimeIsSaved)
{
    launch();
    doubles.queue.run();
    top().pressSave();
    EXPECT_EQ(navigation().presented->rows.rowCount(), 0u);
    navigation().presented->owner.savePressed();
    EXPECT_EQ(file("/logs/KestrumSnapshot-1794809142.kestrum"),
              Value(makeDictionary({{"Timestamp", "2026-11-16 06:05:42 +0000"}})));
}

TEST_F(KestrumAppSaveTest, PanesUnderTheScreenTakeNoBack)
{
    launchConnected();
    showCells();
    open("Serving");
    top().pressSave();
    navigation().pressBack();
    EXPECT_THAT(path(), ElementsAre("Kestrum", "Serving"));
}

TEST_F(KestrumAppSaveTest, ScreenTakesTheKeyboardFromThePaneAndGivesItBackItsToolbar)
{
    launchConnected();
    showCells();
    EXPECT_EQ(top().resigned, 0);
    top().pressSave();
    EXPECT_EQ(top().resigned, 1);

    modem.kill();
    doubles.queue.advance(2s);
    navigation().presented->owner.cancelPressed();
    doubles.queue.run();
    EXPECT_EQ(navigation().presentedAnimated, true);
    EXPECT_EQ(top().status(), "Connecting...");
    EXPECT_NE(top().saveButton(), nullptr);
}

TEST_F(KestrumAppSaveTest, PaneWhosePathIsRemovedIsClosedUnderTheScreen)
{
    launchConnected();
    showCells();
    open("Serving");
    top().pressSave();
    show(makeDictionary({{"Neighbor", cell("-90 dBm")}, {"Detected", cell("-101 dBm")}}));
    EXPECT_NE(navigation().presented, nullptr);
    EXPECT_THAT(path(), ElementsAre("Kestrum"));

    navigation().presented->owner.cancelPressed();
    doubles.queue.run();
    EXPECT_EQ(navigation().presented, nullptr);
    EXPECT_EQ(top().title(), "Kestrum");
}

// Termination

TEST_F(KestrumAppSaveTest, TerminationKeepsItsOrder)
{
    launchConnected();
    showCells();
    top().pressSave();
    app->setWindow(std::make_shared<RecordingWindow>(doubles.toolkit.record));
    app->setSaveViewController(std::make_shared<KestrumSaveViewController>(doubles.applicationRoles, *app, Value()));
    doubles.preferences.onCall = [&] {
        EXPECT_TRUE(app->updateMessage());
        EXPECT_NE(app->saveViewController(), nullptr);
        EXPECT_TRUE(doubles.toolkit.window->visible);
    };
    int ordersOut = 0;
    doubles.toolkit.window->onOrderOut = [&] {
        ++ordersOut;
        EXPECT_EQ(doubles.preferences.calls.size(), 3u);
        EXPECT_EQ(app->updateMessage(), std::nullopt);
        EXPECT_EQ(app->saveViewController(), nullptr);
        EXPECT_NE(app->window(), nullptr);
        // The model still exists, because it provides the status.
        app->updateStatus();
        EXPECT_FALSE(top().isLoading());
    };
    app->applicationWillTerminate();

    EXPECT_THAT(doubles.preferences.calls,
                ElementsAre("set org.kestrum.homescreen HXShowGSMRSSI false", "synchronize org.kestrum.homescreen",
                            "changed org.kestrum.homescreen HXShowGSMRSSI"));
    EXPECT_EQ(ordersOut, 1);
    EXPECT_EQ(app->window(), nullptr);
    app->updateStatus();
    EXPECT_TRUE(top().isLoading()) << "no model any more";

    // Only what is in the properties is cleaned up.
    EXPECT_EQ(doubles.toolkit.record.windows, 1);
    EXPECT_FALSE(doubles.toolkit.window->visible);
    EXPECT_NE(navigation().presented, nullptr);
}

TEST_F(KestrumAppTest, RunningMonitorKeepsTheChannelOpenUntilTheQueueIsDropped)
{
    launchConnected();
    showCells();
    app->applicationWillTerminate();
    EXPECT_TRUE(doubles.ports.hasLocal("org.kestrum.vox.baseband-state-report.log"));
    const int reloads = top().rows.reloads;
    modem.send(cell("-80 dBm"));
    doubles.queue.advance(4s);
    EXPECT_EQ(top().rows.reloads, reloads) << "no observer is notified any more";

    doubles.queue.drop();
    EXPECT_FALSE(doubles.ports.hasLocal("org.kestrum.vox.baseband-state-report.log"));
}

TEST_F(KestrumAppTest, ModelOutlivesTheApplicationUnharmed)
{
    launchConnected();
    modem.send(cell("-80 dBm"));
    app.reset();
    EXPECT_EQ(doubles.toolkit.record.windows, 0);
    doubles.queue.advance(10s);
    EXPECT_EQ(doubles.queue.timers(), 1u);
}

TEST_F(KestrumAppTest, TaskThatFindsNoModelDoesNothing)
{
    launchConnected();
    showCells();
    open("Serving");
    app->applicationWillTerminate();
    app->updateViewControllerFromModel();
    app->showSaveView();
    EXPECT_THAT(path(), ElementsAre("Kestrum", "Serving"));
    EXPECT_EQ(doubles.toolkit.navigation->presentations, 0);
}

TEST_F(KestrumAppTest, MainLoopLaunchesAndTerminatesIt)
{
    app = KestrumApp::make(doubles.applicationRoles);
    doubles.toolkit.mainLoop = [&] {
        EXPECT_TRUE(doubles.toolkit.window->visible);
        EXPECT_THAT(doubles.preferences.calls, IsEmpty());
    };
    EXPECT_EQ(doubles.toolkit.run(*app), 0);
    EXPECT_FALSE(doubles.toolkit.window->visible);
    EXPECT_EQ(doubles.preferences.calls.size(), 3u);
}

TEST_F(KestrumAppTest, TerminatedBeforeItWasLaunchedItOnlyResetsThePreference)
{
    app = KestrumApp::make(doubles.applicationRoles);
    app->applicationWillTerminate();
    EXPECT_EQ(doubles.preferences.calls.size(), 3u);
}

TEST_F(KestrumAppTest, HomeScreenKeyTakesEitherValue)
{
    app = KestrumApp::make(doubles.applicationRoles);
    app->_setGSMRSSI(true);
    EXPECT_EQ(doubles.preferences.calls.front(), "set org.kestrum.homescreen HXShowGSMRSSI true");
}

} // namespace
} // namespace kestrum
