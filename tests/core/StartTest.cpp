// The start of monitoring, and each of its failures.
#include "core/Monitor.h"

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;

class Start : public Monitor {};

TEST_F(Start, NothingIsOpenedBefore)
{
    EXPECT_FALSE(model->isConnected());
    EXPECT_FALSE(ports.hasLocal(kLogPort));
    EXPECT_THAT(telephony.channelsAsked, IsEmpty());
    EXPECT_EQ(queue.timers(), 0u);
    EXPECT_THAT(log.lines, IsEmpty());
}

TEST_F(Start, OpensTheChannelAsksTheTechnologyAndStartsTheLog)
{
    model->startMonitor();

    EXPECT_TRUE(model->isConnected());
    EXPECT_THAT(telephony.channelsAsked, ElementsAre(kLogPort));
    ASSERT_THAT(ports.requests, SizeIs(2));
    EXPECT_EQ(ports.requests[0].port, kCommandPort);
    EXPECT_EQ(ports.requests[0].messageId, 0);
    EXPECT_EQ(ports.requests[0].text(), R"({"GetTechnology": "GetTechnology"})");
    EXPECT_EQ(ports.requests[0].sendTimeout, std::chrono::seconds(1));
    EXPECT_EQ(ports.requests[0].receiveTimeout, std::chrono::seconds(1));
    EXPECT_EQ(ports.requests[0].reply, RemotePort::Reply::Awaited);
    EXPECT_EQ(ports.requests[1].messageId, 0);
    EXPECT_EQ(ports.requests[1].text(), R"({"SetState": "Streaming"})");
    EXPECT_EQ(ports.requests[1].sendTimeout, std::chrono::seconds(1));
    EXPECT_EQ(ports.requests[1].receiveTimeout, std::chrono::seconds(0));
    EXPECT_EQ(ports.requests[1].reply, RemotePort::Reply::None);
    EXPECT_EQ(queue.timers(), 1u);
    EXPECT_EQ(telephony.openConnections(), 0);
}

TEST_F(Start, LogsItsSteps)
{
    model->startMonitor();
    EXPECT_THAT(log.lines, ElementsAre(RecordingLog::Line(Priority::Error, " ***** Created ports (send=0x0, recv=0x0)"),
                                       RecordingLog::Line(Priority::Warning, "Creating Log object: 0x0"),
                                       RecordingLog::Line(Priority::Error, "Got log generated: 0x0"),
                                       RecordingLog::Line(Priority::Error, "Starting the display update timer")));
}

TEST_F(Start, AgainWhileMonitoringRunsDoesNothing)
{
    startRunning();
    model->startMonitor();
    queue.run();
    EXPECT_THAT(ports.requests, IsEmpty());
    EXPECT_THAT(log.lines, IsEmpty());
    EXPECT_THAT(told, IsEmpty());
    EXPECT_EQ(queue.timers(), 1u);
}

TEST_F(Start, SuccessPostsAStatusUpdate)
{
    model->startMonitor();
    EXPECT_THAT(told, IsEmpty()); // never during the call
    queue.run();
    EXPECT_THAT(told, ElementsAre("status"));
}

// Every failure closes the channel, and the model tries again 5 s later.

struct Failure {
    const char* name;
    std::function<void(Monitor&)> fault;
    std::vector<std::string> lines;

    friend void PrintTo(const Failure& shown, std::ostream* out) { *out << shown.name; }
};

class FailingStart : public Start, public testing::WithParamInterface<Failure> {
public:
    // The objects in which the cases cause their faults.
    using Monitor::kCommandPort;
    using Monitor::model;
    using Monitor::modemRuns;
    using Monitor::ports;
    using Monitor::propertyLists;
    using Monitor::replyIs;
    using Monitor::startStatus;
    using Monitor::technology;
    using Monitor::telephony;

    void apply() { GetParam().fault(*this); }
    void mend()
    {
        telephony.reachable = true;
        telephony.answer = {0, 0, kCommandPort};
        propertyLists.writable = true;
        startStatus = 0;
        modemRuns("kVoxLogChannelTechnology_IFX");
        serve();
    }
};

FailingStart& in(Monitor& monitor)
{
    return static_cast<FailingStart&>(monitor);
}

TEST_P(FailingStart, SaysWhyAndClosesTheChannel)
{
    apply();
    model->startMonitor();
    EXPECT_THAT(log.errors(), testing::ElementsAreArray(GetParam().lines));
    EXPECT_FALSE(model->isConnected());
    EXPECT_FALSE(ports.hasLocal(kLogPort));
    EXPECT_EQ(telephony.openConnections(), 0);
    EXPECT_EQ(queue.timers(), 0u);
}

TEST_P(FailingStart, IsTriedAgainAfterFiveSeconds)
{
    apply();
    model->startMonitor();
    queue.run();
    const auto linesOfOneAttempt = log.lines;
    mend();

    seconds(4.999);
    EXPECT_EQ(log.lines, linesOfOneAttempt);
    EXPECT_FALSE(model->isConnected());
    seconds(0.001);
    EXPECT_TRUE(model->isConnected());
    EXPECT_EQ(queue.timers(), 1u);
}

TEST_P(FailingStart, IsRetriedWithoutLimit)
{
    apply();
    model->startMonitor();
    const auto linesOfOneAttempt = log.errors().size();
    // A silent service costs each attempt 1 s of waiting, so this counts attempts, not time.
    for (int hour = 0; hour < 3; ++hour)
        seconds(3600);
    const auto attemptsMade = log.errors().size() / linesOfOneAttempt;
    EXPECT_GE(attemptsMade, 3u * 3600 / 7);
    EXPECT_LE(attemptsMade, 3u * 3600 / 5 + 1);
    EXPECT_EQ(queue.tasks(), 1u);
}

TEST_P(FailingStart, PostsAStatusUpdate)
{
    apply();
    model->startMonitor();
    EXPECT_THAT(told, IsEmpty());
    queue.run();
    EXPECT_THAT(told, ElementsAre("status"));
}

TEST_P(FailingStart, KeepsTheModelUntilTheRetry)
{
    apply();
    model->startMonitor();
    const std::weak_ptr<KestrumModel> watched = model;
    model->setObserver(nullptr);
    model.reset();
    EXPECT_FALSE(watched.expired());
    queue.drop();
    EXPECT_TRUE(watched.expired());
}

const std::string kCreated = " ***** Created ports (send=0x0, recv=0x0)";
const std::string kNoGenerator = "No log generator technology works";
const std::string kGot = "Got log generated: 0x0";

INSTANTIATE_TEST_SUITE_P(
    Of, FailingStart,
    testing::Values(
        Failure{"ServiceNotThere",
                [](Monitor& m) { in(m).telephony.reachable = false; },
                {"Could not create VoxServerConnection", "Could not create the ports necessary"}},
        Failure{"ChannelRefused",
                [](Monitor& m) {
                    in(m).telephony.answer = {1, -536870212, "vox.commands"};
                },
                {"_VoxServerConnectionNetworkMonitorCreateLogChannel returns error: -536870212!",
                 "Could not create the ports necessary"}},
        Failure{"PortNotNamed",
                [](Monitor& m) {
                    in(m).telephony.answer = {0, 0, std::nullopt};
                },
                {"Could not create a log channel (Vox returned null port)!", "Could not create the ports necessary"}},
        Failure{"PortNameEmpty",
                [](Monitor& m) {
                    in(m).telephony.answer = {0, 0, ""};
                },
                {"Could not create a log channel (Vox returned null port)!", "Could not create the ports necessary"}},
        Failure{"NobodyAtTheRemotePort",
                [](Monitor& m) {
                    in(m).telephony.answer = {0, 0, "vox.elsewhere"};
                },
                {"Could not create the remote port!", "Could not create the ports necessary"}},
        Failure{"RequestNotSerialised",
                [](Monitor& m) { in(m).propertyLists.writable = false; },
                {kCreated, " Could not generate GetTechnology command; cannot configure", kNoGenerator}},
        Failure{"RequestNotSent",
                [](Monitor& m) { in(m).technology.status = -4; },
                {kCreated, " ***** Could not send the GetTechnology command (got error=-4)", kNoGenerator}},
        Failure{"SilentService",
                [](Monitor& m) { in(m).technology.reply = std::nullopt; },
                {kCreated, " ***** No response to GetTechnology; cannot configure", kNoGenerator}},
        Failure{"ReplyTooLate",
                [](Monitor& m) { in(m).technology.after = std::chrono::milliseconds(1001); },
                {kCreated, " ***** No response to GetTechnology; cannot configure", kNoGenerator}},
        Failure{"ReplyIsNoPropertyList",
                [](Monitor& m) { in(m).replyIs(Value()); },
                {kCreated, " ***** Could not parse reply to GetTechnology; cannot configure", kNoGenerator}},
        Failure{"ReplyHasNoAnswer",
                [](Monitor& m) {
                    in(m).replyIs(makeDictionary({{"SetState", "Streaming"}}));
                },
                {kCreated, " ***** Reply to GetTechnology had no answer; cannot configure", kNoGenerator}},
        Failure{"ReplyIsNoDictionary",
                [](Monitor& m) { in(m).replyIs("kVoxLogChannelTechnology_IFX"); },
                {kCreated, " ***** Reply to GetTechnology had no answer; cannot configure", kNoGenerator}},
        Failure{"TechnologyUnknown",
                [](Monitor& m) { in(m).modemRuns("kVoxLogChannelTechnology_Other"); },
                {kCreated, kGot, kNoGenerator}},
        Failure{"TechnologyIsNoText",
                [](Monitor& m) {
                    in(m).replyIs(makeDictionary({{"GetTechnology", 3}}));
                },
                {kCreated, kGot, kNoGenerator}},
        Failure{"StartCommandNotSent",
                [](Monitor& m) { in(m).startStatus = -2; },
                {kCreated, kGot, " ***** Could not send the START command (got error=-2)"}}),
    [](const auto& each) { return std::string(each.param.name); });

TEST_F(Start, StartCommandThatCannotBeSerialisedFails)
{
    // The request is sent, then serialising fails.
    whileAsked = [this] { propertyLists.writable = false; };
    model->startMonitor();
    EXPECT_THAT(log.errors(), ElementsAre(kCreated, kGot, " Could not generate PLIST"));
    EXPECT_FALSE(model->isConnected());

    whileAsked = nullptr;
    propertyLists.writable = true;
    seconds(5);
    EXPECT_TRUE(model->isConnected());
}

TEST_F(Start, ThatFailsWithAnExceptionDoesNotBlockTheNext)
{
    whileAsked = [] { throw std::runtime_error("thrown"); };
    EXPECT_THROW(model->startMonitor(), std::runtime_error);
    whileAsked = nullptr;
    model->restartMonitor();
    EXPECT_TRUE(model->isConnected());
}

TEST_F(Start, WithoutALocalPortTheServiceIsAskedAllTheSame)
{
    ports.createsLocal = false;
    model->startMonitor();
    EXPECT_THAT(telephony.channelsAsked, ElementsAre(kLogPort));
    EXPECT_FALSE(model->isConnected());
    EXPECT_EQ(queue.timers(), 0u);
    ports.createsLocal = true;
    seconds(5);
    EXPECT_TRUE(model->isConnected());
}

TEST_F(Start, RetryAfterASuccessfulRestartDoesNothing)
{
    telephony.reachable = false;
    model->startMonitor();
    telephony.reachable = true;
    seconds(1);
    model->restartMonitor();
    ASSERT_TRUE(model->isConnected());
    queue.run();
    ports.requests.clear();
    told.clear();

    seconds(10);
    EXPECT_THAT(ports.requests, IsEmpty());
    EXPECT_EQ(queue.timers(), 1u);
    EXPECT_THAT(told, IsEmpty());
}

TEST_F(Start, AtMostOneRetryIsPending)
{
    telephony.reachable = false;
    for (int i = 0; i < 3; ++i)
        model->restartMonitor();
    queue.run();
    EXPECT_EQ(queue.tasks(), 1u);
}

TEST_F(Start, DestroyedModelGetsAndSendsNoNotifications)
{
    startRunning();
    stream(makeDictionary({{"RAT", "GSM"}}));
    model->refresh();
    model->destroyPorts();
    model.reset();
    queue.run();
    EXPECT_THAT(told, IsEmpty());
}

TEST_F(Start, RemovedObserverGetsNoNotifications)
{
    model->startMonitor();
    model->setObserver(nullptr);
    queue.run();
    EXPECT_THAT(told, IsEmpty());
}

// configureGenerator is asymmetric: only an answer replaces the generator.

class Reconfigured : public Start {
protected:
    Reconfigured()
    {
        startRunning();
        stream(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}}));
    }
};

TEST_F(Reconfigured, EarlierGeneratorStaysWhenTheExchangeFails)
{
    technology = {-4, std::nullopt};
    model->restartMonitor();
    EXPECT_TRUE(model->isConnected());
    EXPECT_EQ(log.count(" ***** Could not send the GetTechnology command (got error=-4)"), 1u);
    EXPECT_EQ(ports.requests.back().text(), R"({"SetState": "Streaming"})");

    technology = {0, std::nullopt};
    model->restartMonitor();
    EXPECT_TRUE(model->isConnected());
    EXPECT_EQ(log.count(" ***** No response to GetTechnology; cannot configure"), 1u);

    replyIs(Value());
    model->restartMonitor();
    EXPECT_TRUE(model->isConnected());
    EXPECT_EQ(log.count(" ***** Could not parse reply to GetTechnology; cannot configure"), 1u);

    replyIs(makeDictionary());
    model->restartMonitor();
    EXPECT_TRUE(model->isConnected());
    EXPECT_EQ(log.count(" ***** Reply to GetTechnology had no answer; cannot configure"), 1u);

    EXPECT_EQ(log.count("Got log generated: 0x0"), 0u);
    EXPECT_EQ(textAt("/RAT"), "GSM");
}

TEST_F(Reconfigured, UnknownTechnologyTakesTheGeneratorAway)
{
    modemRuns("kVoxLogChannelTechnology_Other");
    model->restartMonitor();
    EXPECT_FALSE(model->isConnected());
    EXPECT_EQ(log.errors().back(), "No log generator technology works");
    EXPECT_EQ(model->getSaveContents(), nullptr);
}

TEST_F(Reconfigured, RestartKeepsTheStateAndReplacesTheGenerator)
{
    model->refresh();
    model->topLevelNodes();
    ASSERT_THAT(*model->getSaveContents(), SizeIs(1));
    model->restartMonitor();
    EXPECT_EQ(log.count("Creating Log object: 0x0"), 1u);
    EXPECT_THAT(*model->getSaveContents(), SizeIs(1));
    EXPECT_EQ(textAt("/RAT"), "GSM");
}

} // namespace
} // namespace kestrum
