#include "doubles/RecordingLog.h"
#include "harness/Scratch.h"
#include "platform/qt/LinuxMessagePorts.h"
#include "platform/qt/LinuxTelephonyService.h"
#include "platform/qt/QtMainQueue.h"
#include "posix/RawSocket.h"
#include "qtplatform/EventLoop.h"

#include <gmock/gmock.h>

#include <thread>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

/// A service on a plain socket in a thread of the test, so that it can be slow.
class TelephonyServiceTest : public testing::Test {
protected:
    ~TelephonyServiceTest() override
    {
        if (played.joinable())
            played.join();
    }

    /// Serves the next client.
    void play(std::function<void(RawSocket&)> part)
    {
        played = std::thread([this, part = std::move(part)] {
            auto client = listening.accept();
            part(client);
        });
    }
    static std::string words(std::uint32_t domain, std::uint32_t code)
    {
        std::string bytes;
        for (auto word : {domain, code})
            for (int i = 0; i < 4; ++i, word >>= 8)
                bytes.push_back(static_cast<char>(word & 0xFF));
        return bytes;
    }

    ScratchDirectory directory;
    RecordingLog log;
    QtMainQueue queue;
    LinuxMessagePorts ports{directory.path(), queue, log};
    LinuxTelephonyService telephony{directory.path(), ports, queue, log};
    std::unique_ptr<LocalPort> local = ports.createLocal("log", [](auto, auto) {});
    RawSocket listening = RawSocket::listenAt(directory / "org.kestrum.vox");
    std::thread played;
};

const std::string kRequestForLog = "log." + std::to_string(::getpid());
const std::size_t kRequestSize = 13 + kRequestForLog.size();

TEST_F(TelephonyServiceTest, IsNotReachedWithoutAListener)
{
    listening.close();
    EXPECT_FALSE(telephony.connect({}));
    std::filesystem::remove(directory / "org.kestrum.vox");
    EXPECT_FALSE(telephony.connect({}));
}

TEST_F(TelephonyServiceTest, AsksForALogToThisProcessesPortAndGivesTheAnswer)
{
    std::string request;
    play([&](RawSocket& client) {
        request = client.receive(kRequestSize);
        client.send(frame(kReply, 1, 1, words(0, 0) + "org.kestrum.vox.command.77.1"));
    });
    const auto connection = telephony.connect({});
    ASSERT_TRUE(connection);
    const auto answer = connection->networkMonitorCreateLogChannel("log");
    EXPECT_EQ(answer.errorDomain, 0);
    EXPECT_EQ(answer.errorCode, 0);
    EXPECT_EQ(answer.remotePort, "org.kestrum.vox.command.77.1");
    EXPECT_EQ(request, frame(kRequest, 1, 1, kRequestForLog));
}

TEST_F(TelephonyServiceTest, GivesTheErrorPairOfARefusal)
{
    play([&](RawSocket& client) {
        client.receive(kRequestSize);
        client.send(frame(kReply, 1, 1, words(1, 0xFFFFFFFE)));
    });
    const auto answer = telephony.connect({})->networkMonitorCreateLogChannel("log");
    EXPECT_EQ(answer.errorDomain, 1);
    EXPECT_EQ(answer.errorCode, -2);
    EXPECT_FALSE(answer.remotePort);
}

TEST_F(TelephonyServiceTest, GivesSuccessWithoutAPortAsItCame)
{
    play([&](RawSocket& client) {
        client.receive(kRequestSize);
        client.send(frame(kReply, 1, 1, words(0, 0)));
    });
    const auto answer = telephony.connect({})->networkMonitorCreateLogChannel("log");
    EXPECT_EQ(answer.errorCode, 0);
    EXPECT_FALSE(answer.remotePort);
}

TEST_F(TelephonyServiceTest, GivesUpOnASilentServiceAfterASecond)
{
    std::atomic<bool> over = false;
    play([&](RawSocket& client) {
        client.receive(kRequestSize);
        client.receive(1); // until the client closes
        over = true;
    });
    auto connection = telephony.connect({});
    const auto before = std::chrono::steady_clock::now();
    const auto answer = connection->networkMonitorCreateLogChannel("log");
    const auto took = std::chrono::steady_clock::now() - before;
    EXPECT_EQ(answer.errorCode, ETIMEDOUT);
    EXPECT_GE(took, 900ms);
    EXPECT_LT(took, 5s);
    connection.reset();
    EXPECT_TRUE(eventually([&] { return over.load(); }));
}

TEST_F(TelephonyServiceTest, ServesTimersAndTasksWhileItWaits)
{
    constexpr int kEnough = 5;
    std::atomic<int> ticks = 0, tasks = 0;
    play([&](RawSocket& client) {
        client.receive(kRequestSize);
        while (client.isOpen() && !client.isAbandoned() && (ticks < kEnough || tasks < 1))
            std::this_thread::yield();
        client.send(frame(kReply, 1, 1, words(0, 0) + "port"));
    });
    const auto connection = telephony.connect({});
    const auto timer = queue.repeat(1ms, [&] { ++ticks; });
    queue.post([&] { ++tasks; });
    EXPECT_EQ(connection->networkMonitorCreateLogChannel("log").remotePort, "port");
    EXPECT_GE(ticks, kEnough);
    EXPECT_EQ(tasks, 1);
}

TEST_F(TelephonyServiceTest, MayBeDestroyedWhileItWaits)
{
    play([&](RawSocket& client) {
        client.receive(kRequestSize);
        client.receive(1); // until the client closes
    });
    auto connection = telephony.connect([](std::string_view) { ADD_FAILURE() << "heard"; });
    queue.post([&] { connection.reset(); });
    EXPECT_EQ(connection->networkMonitorCreateLogChannel("log").errorCode, EPIPE);
    EXPECT_FALSE(connection);
}

TEST_F(TelephonyServiceTest, TakesTheAnswerThatCameBehindManyNotificationsJustBeforeTheServiceWent)
{
    play([&](RawSocket& client) {
        client.receive(kRequestSize);
        std::string bytes;
        for (int i = 0; i < 1000; ++i)
            bytes += frame(kMessage, 2, 0, "name");
        client.send(bytes + frame(kReply, 1, 1, words(0, 0) + "port"));
    });
    EXPECT_EQ(telephony.connect({})->networkMonitorCreateLogChannel("log").remotePort, "port");
}

TEST_F(TelephonyServiceTest, FailsAtOnceWhenThePeerCloses)
{
    play([&](RawSocket& client) { client.receive(kRequestSize); });
    const auto before = std::chrono::steady_clock::now();
    EXPECT_EQ(telephony.connect({})->networkMonitorCreateLogChannel("log").errorCode, EPIPE);
    EXPECT_LT(std::chrono::steady_clock::now() - before, 900ms);
}

TEST_F(TelephonyServiceTest, AnAnswerThatIsTooShortIsAFailure)
{
    play([&](RawSocket& client) {
        client.receive(kRequestSize);
        client.send(frame(kReply, 1, 1, "seven.."));
    });
    EXPECT_EQ(telephony.connect({})->networkMonitorCreateLogChannel("log").errorCode, EBADMSG);
}

TEST_F(TelephonyServiceTest, AMalformedFrameIsAFailureWithOneLine)
{
    play([&](RawSocket& client) {
        client.receive(kRequestSize);
        client.send("\xFF\xFF\xFF\xFF");
        client.receive(1);
    });
    EXPECT_EQ(telephony.connect({})->networkMonitorCreateLogChannel("log").errorCode, EPIPE);
    EXPECT_EQ(log.errors().size(), 1u);
}

TEST_F(TelephonyServiceTest, SkipsRepliesToOtherRequests)
{
    play([&](RawSocket& client) {
        client.receive(kRequestSize);
        client.send(frame(kReply, 1, 99, words(0, 0) + "wrong") + frame(kReply, 1, 1, words(0, 0) + "right"));
    });
    EXPECT_EQ(telephony.connect({})->networkMonitorCreateLogChannel("log").remotePort, "right");
}

TEST_F(TelephonyServiceTest, NotificationsArriveOnTheMainQueueUntilTheConnectionGoes)
{
    std::atomic<bool> sent = false;
    play([&](RawSocket& client) {
        // One during the wait for an answer, one from the event loop.
        client.receive(kRequestSize);
        client.send(frame(kMessage, 2, 0, "first") + frame(kReply, 1, 1, words(0, 0) + "port") +
                    frame(kMessage, 2, 0, "second"));
        client.receive(1);
        sent = true;
    });
    std::vector<std::string> names;
    auto connection = telephony.connect([&](std::string_view name) { names.emplace_back(name); });
    EXPECT_EQ(connection->networkMonitorCreateLogChannel("log").remotePort, "port");
    EXPECT_THAT(names, IsEmpty()) << "not within the call";
    ASSERT_TRUE(eventually([&] { return names.size() == 2; }));
    EXPECT_THAT(names, ElementsAre("first", "second"));
    connection.reset();
    EXPECT_TRUE(eventually([&] { return sent.load(); }));
}

TEST_F(TelephonyServiceTest, ItsEndCancelsNotificationsStillQueued)
{
    play([&](RawSocket& client) {
        client.receive(kRequestSize);
        client.send(frame(kMessage, 2, 0, "unheard") + frame(kReply, 1, 1, words(0, 0) + "port"));
        client.receive(1);
    });
    auto connection = telephony.connect([](std::string_view) { ADD_FAILURE() << "heard"; });
    connection->networkMonitorCreateLogChannel("log");
    connection.reset();
    bool settled = false;
    queue.post(10ms, [&] { settled = true; });
    EXPECT_TRUE(eventually([&] { return settled; }));
}

TEST_F(TelephonyServiceTest, AFloodOfNotificationsTakesOneTaskAndNoLongerThanSilence)
{
    std::atomic<bool> over = false;
    play([&](RawSocket& client) {
        client.receive(kRequestSize);
        std::string flood;
        for (int i = 0; i < 5000; ++i)
            flood += frame(kMessage, 2, 0, "kVoxTechnologyChangedNotification");
        while (client.send(flood))
            continue;
        over = true;
    });
    int heard = 0;
    auto connection = telephony.connect([&](std::string_view) { ++heard; });
    EXPECT_EQ(connection->networkMonitorCreateLogChannel("log").errorCode, ETIMEDOUT);
    bool settled = false;
    queue.post([&] { settled = true; });
    EXPECT_TRUE(eventually([&] { return settled; }));
    EXPECT_EQ(heard, 1);
    connection.reset();
    EXPECT_TRUE(eventually([&] { return over.load(); }));
}

TEST_F(TelephonyServiceTest, NotificationsOfManyNamesAreBounded)
{
    play([&](RawSocket& client) {
        client.receive(kRequestSize);
        std::string many = frame(kMessage, 2, 0, std::string(1000, 'x'));
        for (int i = 0; i < 5000; ++i)
            many += frame(kMessage, 2, 0, "name " + std::to_string(i));
        client.send(many + frame(kReply, 1, 1, words(0, 0) + "port"));
        client.receive(1);
    });
    std::vector<std::string> names;
    auto connection = telephony.connect([&](std::string_view name) { names.emplace_back(name); });
    EXPECT_EQ(connection->networkMonitorCreateLogChannel("log").remotePort, "port");
    ASSERT_TRUE(eventually([&] { return !names.empty(); }));
    EXPECT_EQ(names.size(), 16u);
    EXPECT_EQ(names.front(), "name 0");
}

TEST_F(TelephonyServiceTest, AsksForNoLogToAPortThatDoesNotListen)
{
    std::string asked;
    play([&](RawSocket& client) { asked = client.receive(1); });
    auto connection = telephony.connect({});
    ASSERT_TRUE(connection);
    EXPECT_EQ(connection->networkMonitorCreateLogChannel("other").errorCode, ENOTCONN);
    local.reset();
    EXPECT_EQ(connection->networkMonitorCreateLogChannel("log").errorCode, ENOTCONN);
    connection.reset();
    played.join();
    EXPECT_EQ(asked, "");
}

TEST_F(TelephonyServiceTest, SaysWhyThereIsNoChannel)
{
    EXPECT_EQ(telephony.problem(), std::nullopt);
    const auto refusedWith = [&](std::uint32_t code) {
        play([&](RawSocket& client) {
            client.receive(kRequestSize);
            client.send(frame(kReply, 1, 1, words(1, code)));
        });
        telephony.connect({})->networkMonitorCreateLogChannel("log");
        played.join();
        return telephony.problem().value_or(Problem()).text;
    };
    EXPECT_EQ(refusedWith(2), "The telephony service has no channel left for this display.");
    EXPECT_EQ(refusedWith(3), "The telephony service cannot reach this display.");
    EXPECT_EQ(refusedWith(77), "The telephony service refuses the request: error 77.");
    EXPECT_EQ(refusedWith(0), "");
    listening.close();
    telephony.connect({});
    EXPECT_EQ(telephony.problem(), Problem{"No telephony service can be reached in " + directory.path() + "."});
}

TEST_F(TelephonyServiceTest, ReportsThatTheReceivePortCouldNotBeCreated)
{
    EXPECT_FALSE(ports.createLocal("log", [](auto, auto) {}));
    local.reset();
    telephony.connect({})->networkMonitorCreateLogChannel("log");
    EXPECT_THAT(telephony.problem().value_or(Problem()).text,
                testing::StartsWith("This display cannot be reached: another process listens at"));
}

TEST_F(TelephonyServiceTest, MayBeDestroyedWithinItsNotification)
{
    play([&](RawSocket& client) {
        client.send(frame(kMessage, 2, 0, "one") + frame(kMessage, 2, 0, "two"));
        client.receive(1);
    });
    std::unique_ptr<VoxServerConnection> connection;
    int heard = 0;
    connection = telephony.connect([&](std::string_view) {
        ++heard;
        connection.reset();
    });
    ASSERT_TRUE(eventually([&] { return heard > 0; }));
    bool settled = false;
    queue.post(10ms, [&] { settled = true; });
    EXPECT_TRUE(eventually([&] { return settled; }));
    EXPECT_EQ(heard, 1);
}

} // namespace
} // namespace kestrum
