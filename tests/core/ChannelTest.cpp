// The end of the log channel: by itself, by a call, and during other work.
#include "core/Monitor.h"

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class Channel : public Monitor {
protected:
    static constexpr const char* kInvalidated = " ***** INVALIDATED 0x0 *****";

    Value display(const char* rat) { return makeDictionary({{"RAT", rat}, {"Cell", "17"}}); }
};

TEST_F(Channel, DeliversNothingBeforeItIsOpen)
{
    EXPECT_FALSE(ports.send(kLogPort, 0, "list"));
}

TEST_F(Channel, DeathWhileIdleIsFoundByTheNextRefreshAndRestarts)
{
    startRunning();
    ports.kill(kCommandPort);
    queue.run();
    EXPECT_THAT(log.lines, IsEmpty()); // the invalidation alone logs nothing
    serve();

    seconds(2);
    EXPECT_EQ(log.count(kInvalidated), 1u);
    EXPECT_EQ(attempts(), 1u);
    EXPECT_TRUE(model->isConnected());
    EXPECT_EQ(queue.timers(), 1u);
    EXPECT_THAT(told, ElementsAre("status"));
}

TEST_F(Channel, DeathWithoutAServiceToComeBackToIsRetriedEveryFiveSeconds)
{
    startRunning();
    ports.kill(kCommandPort);
    seconds(2);
    EXPECT_FALSE(model->isConnected());
    EXPECT_EQ(log.errors().back(), "Could not create the ports necessary");
    EXPECT_THAT(told, ElementsAre("status"));
    serve();
    seconds(4.999);
    EXPECT_FALSE(model->isConnected());
    seconds(0.001);
    EXPECT_TRUE(model->isConnected());
    EXPECT_THAT(told, ElementsAre("status", "status"));
}

TEST_F(Channel, DeathWhileRecordsStreamKeepsTheDisplayAndGoesOnAfterwards)
{
    startRunning();
    stream(display("GSM"));
    seconds(2);
    ASSERT_EQ(textAt("/RAT"), "GSM");
    ports.send(kLogPort, 0, "list");
    ports.kill(kCommandPort);
    serve();
    seconds(2);
    EXPECT_EQ(log.count(kInvalidated), 1u);
    EXPECT_EQ(textAt("/RAT"), "GSM");

    stream(display("UMTS"));
    seconds(2);
    EXPECT_EQ(textAt("/RAT"), "UMTS");
}

TEST_F(Channel, DeathWhileTheReplyIsAwaitedEndsTheAttempt)
{
    replyIs(makeDictionary({{"GetTechnology", "kVoxLogChannelTechnology_IFX"}}), std::chrono::milliseconds(900));
    whileAsked = [this] { queue.post([this] { ports.kill(kCommandPort); }); };
    model->startMonitor();
    EXPECT_EQ(queue.now(), std::chrono::milliseconds(0)); // the wait ended at once
    EXPECT_THAT(log.errors(), ElementsAre(" ***** Created ports (send=0x0, recv=0x0)",
                                          " ***** No response to GetTechnology; cannot configure",
                                          "No log generator technology works"));
    whileAsked = nullptr;
    serve();
    seconds(6);
    EXPECT_TRUE(model->isConnected());
}

TEST_F(Channel, InvalidatedLocalPortRestarts)
{
    startRunning();
    ports.invalidateLocal(kLogPort);
    EXPECT_THAT(log.lines, IsEmpty()); // not during the call that invalidates
    queue.run();
    EXPECT_EQ(log.lines.front(), RecordingLog::Line(Priority::Error, kInvalidated));
    EXPECT_EQ(attempts(), 1u);
    EXPECT_TRUE(model->isConnected());
}

TEST_F(Channel, DeliberateCloseDoesNotRestart)
{
    startRunning();
    model->destroyPorts();
    EXPECT_FALSE(model->isConnected());
    EXPECT_EQ(queue.timers(), 0u);
    seconds(60);
    EXPECT_THAT(log.lines, IsEmpty());
    EXPECT_THAT(ports.requests, IsEmpty());
    EXPECT_THAT(told, IsEmpty());
}

TEST_F(Channel, DeliberateCloseCancelsAPendingInvalidation)
{
    startRunning();
    ports.invalidateLocal(kLogPort);
    model->destroyPorts();
    seconds(60);
    EXPECT_THAT(log.lines, IsEmpty());
}

TEST_F(Channel, ClosingTwiceOrBeforeOpeningIsHarmless)
{
    model->destroyPorts();
    model->destroyPorts();
    startRunning();
    model->destroyPorts();
    model->destroyPorts();
    EXPECT_FALSE(model->isConnected());
    model->startMonitor();
    EXPECT_TRUE(model->isConnected());
}

TEST_F(Channel, ClosingLeavesGeneratorAndStateAlone)
{
    startRunning();
    stream(display("GSM"));
    model->destroyPorts();
    EXPECT_EQ(textAt("/RAT"), "GSM");
}

TEST_F(Channel, MessageOnItsWayIsLostWhenTheChannelCloses)
{
    startRunning();
    propertyLists.parsed["list"] = display("GSM");
    ports.send(kLogPort, 0, "list");
    model->restartMonitor();
    queue.run();
    told.clear();
    seconds(2);
    EXPECT_THAT(told, IsEmpty());
}

TEST_F(Channel, MessagesAreServedWhileTheReplyIsAwaited)
{
    startRunning();
    replyIs(makeDictionary({{"GetTechnology", "kVoxLogChannelTechnology_IFX"}}), std::chrono::milliseconds(500));
    propertyLists.parsed["list"] = display("GSM");
    whileAsked = [this] { ports.send(kLogPort, 0, "list"); };
    model->restartMonitor();
    EXPECT_EQ(queue.now(), std::chrono::milliseconds(500));
    EXPECT_EQ(textAt("/RAT"), "GSM");
}

TEST_F(Channel, StartWhileTheReplyIsAwaitedDoesNothing)
{
    replyIs(makeDictionary({{"GetTechnology", "kVoxLogChannelTechnology_IFX"}}), std::chrono::milliseconds(500));
    whileAsked = [this] { queue.post([this] { model->startMonitor(); }); };
    model->startMonitor();
    queue.run();
    EXPECT_TRUE(model->isConnected());
    EXPECT_EQ(attempts(), 1u);
    EXPECT_EQ(queue.timers(), 1u);
    EXPECT_EQ(queue.tasks(), 0u);
}

TEST_F(Channel, RestartWhileTheReplyIsAwaitedEndsTheAttemptAndLeavesOneRetry)
{
    replyIs(makeDictionary({{"GetTechnology", "kVoxLogChannelTechnology_IFX"}}), std::chrono::milliseconds(500));
    whileAsked = [this] {
        whileAsked = nullptr;
        queue.post([this] { model->restartMonitor(); });
    };
    model->startMonitor();
    queue.run();
    EXPECT_EQ(attempts(), 1u);
    EXPECT_FALSE(model->isConnected());
    EXPECT_EQ(log.errors().back(), "No log generator technology works");
    EXPECT_EQ(queue.timers(), 0u);
    EXPECT_EQ(queue.tasks(), 1u);
    seconds(6);
    EXPECT_TRUE(model->isConnected());
    EXPECT_EQ(queue.timers(), 1u);
}

TEST_F(Channel, RestartWhileTheReplyIsAwaitedWithAnEarlierGeneratorFailsAtTheStartCommand)
{
    startRunning();
    replyIs(makeDictionary({{"GetTechnology", "kVoxLogChannelTechnology_IFX"}}), std::chrono::milliseconds(500));
    whileAsked = [this] {
        whileAsked = nullptr;
        queue.post([this] { model->restartMonitor(); });
    };
    model->restartMonitor();
    EXPECT_THAT(log.errors(), ElementsAre(" ***** Created ports (send=0x0, recv=0x0)",
                                          " ***** No response to GetTechnology; cannot configure",
                                          " ***** Could not send the START command (got error=-1)"));
    EXPECT_FALSE(model->isConnected());
    queue.run();
    EXPECT_EQ(queue.tasks(), 1u); // the retry
}

TEST_F(Channel, ModelReleasedWhileTheReplyIsAwaitedEndsItsAttempt)
{
    replyIs(makeDictionary({{"GetTechnology", "kVoxLogChannelTechnology_IFX"}}), std::chrono::milliseconds(500));
    whileAsked = [this] {
        queue.post([this] {
            model->setObserver(nullptr);
            model.reset();
        });
    };
    model->startMonitor();
    EXPECT_EQ(model, nullptr);
    EXPECT_EQ(queue.timers(), 1u); // its timer keeps it running
    queue.drop();
    EXPECT_FALSE(ports.hasLocal(kLogPort));
}

// Creating the log channel runs the queue, as the wait for the reply does.

class ChannelCreation : public Channel {
protected:
    /// Runs during the wait for the service's answer.
    void inTheWait(std::function<void()> task)
    {
        telephony.answersAfter = std::chrono::milliseconds(500);
        telephony.whileCreating = [this, task] {
            telephony.whileCreating = nullptr;
            queue.post(std::chrono::milliseconds(1), task);
        };
    }
};

TEST_F(ChannelCreation, ServesTimersWhileItWaits)
{
    int ticks = 0;
    const auto timer = queue.repeat(std::chrono::milliseconds(100), [&] { ++ticks; });
    telephony.answersAfter = std::chrono::milliseconds(500);
    model->startMonitor();
    EXPECT_EQ(ticks, 5);
    EXPECT_TRUE(model->isConnected());
}

TEST_F(ChannelCreation, GivesUpOnASilentServiceAfterASecond)
{
    telephony.answersAfter = std::chrono::milliseconds(1001);
    model->startMonitor();
    EXPECT_EQ(queue.now(), std::chrono::milliseconds(1000));
    EXPECT_THAT(
        log.errors(),
        ElementsAre(testing::MatchesRegex("_VoxServerConnectionNetworkMonitorCreateLogChannel returns error: [0-9]+!"),
                    "Could not create the ports necessary"));
    EXPECT_FALSE(ports.hasLocal(kLogPort));
}

TEST_F(ChannelCreation, HasNoEffectWhenTheChannelWasClosedDuringIt)
{
    inTheWait([this] { model->destroyPorts(); });
    model->startMonitor();
    EXPECT_THAT(log.errors(), ElementsAre("Could not create the ports necessary"));
    EXPECT_FALSE(model->isConnected());
    EXPECT_THAT(ports.requests, IsEmpty());
    telephony.answersAfter = std::chrono::milliseconds(0);
    seconds(5);
    EXPECT_TRUE(model->isConnected());
}

TEST_F(ChannelCreation, IsNotNestedByAStartAndEndedByARestart)
{
    inTheWait([this] { model->startMonitor(); });
    model->startMonitor();
    EXPECT_TRUE(model->isConnected());
    EXPECT_THAT(telephony.channelsAsked, testing::SizeIs(1));

    inTheWait([this] { model->restartMonitor(); });
    model->restartMonitor();
    EXPECT_FALSE(model->isConnected());
    EXPECT_THAT(telephony.channelsAsked, testing::SizeIs(2));
    queue.run();
    EXPECT_EQ(queue.tasks(), 1u); // the retry
}

TEST_F(ChannelCreation, ContinuesWithAModelThatWasReleased)
{
    inTheWait([this] {
        model->setObserver(nullptr);
        model.reset();
    });
    model->startMonitor();
    EXPECT_EQ(model, nullptr);
    EXPECT_EQ(queue.timers(), 1u); // its timer keeps it running
    queue.drop();
    EXPECT_FALSE(ports.hasLocal(kLogPort));
}

TEST_F(Channel, GetsNoNotificationBecauseItsConnectionEndsWithTheCall)
{
    model->updateWithData(bytesOf("anything"));
    telephony.whileCreating = [this] { telephony.notify("any name"); };
    telephony.answersAfter = std::chrono::milliseconds(500);
    model->startMonitor();
    queue.run();
    EXPECT_THAT(told, ElementsAre("status"));
    EXPECT_EQ(telephony.openConnections(), 0);
}

TEST_F(Channel, RefreshOfADeadChannelInvalidatesOnce)
{
    startRunning();
    ports.kill(kCommandPort);
    serve();
    model->refresh();
    model->refresh();
    queue.run();
    EXPECT_EQ(log.count(kInvalidated), 1u);
    EXPECT_EQ(attempts(), 1u);
}

// Messages from the service besides the log.

TEST_F(Channel, CountsTheMessagesThatTheServiceDroppedAndTellsOnceForSeveral)
{
    using namespace std::string_view_literals;
    startRunning();
    stream(display("GSM"));
    seconds(2);
    told.clear();

    ports.send(kLogPort, 1, "\x05\0\0\0\0\0\0\0"sv);
    ports.send(kLogPort, 1, "\x02\0\0\0\x01\0\0\0"sv);
    queue.run();
    EXPECT_EQ(model->lostMessages(), (std::uint64_t{1} << 32) + 7);
    EXPECT_THAT(told, ElementsAre("lost 4294967303"));
    seconds(2);
    EXPECT_THAT(told, ElementsAre("lost 4294967303")) << "no record has come";

    ports.send(kLogPort, 1, "\xFF\xFF\xFF\xFF\xFF\xFF\xFF\xFF"sv);
    queue.run();
    EXPECT_EQ(model->lostMessages(), std::numeric_limits<std::uint64_t>::max()) << "does not wrap";
    EXPECT_THAT(told, ElementsAre("lost 4294967303", "lost 18446744073709551615"));
}

TEST_F(Channel, IgnoresInvalidLossReportsAndMessagesOfOtherIds)
{
    using namespace std::string_view_literals;
    startRunning();
    ports.send(kLogPort, 1, ""sv);
    ports.send(kLogPort, 1, "\x05\0\0\0\0\0\0"sv);
    ports.send(kLogPort, 1, "\0\0\0\0\0\0\0\0"sv);
    ports.send(kLogPort, 2, "\x05\0\0\0\0\0\0\0"sv);
    ports.send(kLogPort, -1, "\x05\0\0\0\0\0\0\0"sv);
    queue.run();
    EXPECT_EQ(model->lostMessages(), 0u);
    EXPECT_THAT(told, IsEmpty());
}

TEST_F(Channel, SaysWhyThereIsNoConnection)
{
    EXPECT_EQ(model->connectionProblem(), std::nullopt);
    ports.kill(kCommandPort);
    telephony.why = "No telephony service can be reached.";
    model->startMonitor();
    EXPECT_EQ(model->connectionProblem(), Problem{"No telephony service can be reached."});

    telephony.why.clear();
    serve();
    replyIs({});
    seconds(5);
    EXPECT_EQ(model->connectionProblem(),
              Problem{"The telephony service does not say which technology the modem runs."});

    modemRuns("kVoxLogChannelTechnology_IFX");
    seconds(5);
    EXPECT_TRUE(model->isConnected());
    EXPECT_EQ(model->connectionProblem(), std::nullopt);
}

} // namespace
} // namespace kestrum
