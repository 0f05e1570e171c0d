#include "contracts/Worlds.h"
#include "doubles/MemoryPorts.h"
#include "doubles/RecordingLog.h"
#include "harness/Scratch.h"
#include "platform/posix/VoxProtocol.h"
#include "platform/qt/FrameSocket.h"
#include "platform/qt/LinuxMessagePorts.h"
#include "platform/qt/LinuxTelephonyService.h"

#include <gmock/gmock.h>

#include <cerrno>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using std::chrono::milliseconds;
using testing::ElementsAre;
using testing::IsEmpty;

struct MemoryWorld : CrankedLoop {
    MemoryPorts ports{queue};
    MemoryTelephony telephony{queue, ports};

    void serve(const LogChannelAnswer& answer, milliseconds after = 0ms)
    {
        telephony.answer = answer;
        telephony.answersAfter = after;
    }
    void goAway() { telephony.reachable = false; }
    void whenAsked(std::function<void()> run) { telephony.whileCreating = std::move(run); }
    void notify(const std::string& name) { telephony.notify(name); }
};

struct SocketWorld : QtLoop {
    ScratchDirectory directory;
    RecordingLog log;
    LinuxMessagePorts ports{directory.path(), queue, log};
    LinuxTelephonyService telephony{directory.path(), ports, queue, log};

    SocketWorld()
    {
        listener->accepted = [this](auto connection) {
            client = std::move(connection);
            client->readable = [this] { read(); };
        };
        EXPECT_EQ(listener->listen(directory / "org.kestrum.vox"), std::nullopt);
    }
    void serve(const LogChannelAnswer& with, milliseconds delay = 0ms)
    {
        answer = with;
        after = delay;
    }
    void goAway() { listener.reset(); }
    void whenAsked(std::function<void()> run) { asked = std::move(run); }
    void notify(const std::string& name)
    {
        eventually([&] { return client != nullptr; });
        client->send({Frame::Kind::Message, vox::kNotification, 0, bytesOf(name)});
    }

private:
    void read()
    {
        while (const auto request = client->next()) {
            if (asked)
                asked();
            queue.post(after, [this, id = request->messageId, serial = request->serial] {
                const auto bytes = vox::encode(answer);
                client->send({Frame::Kind::Reply, id, serial, bytes});
            });
        }
    }

    std::unique_ptr<FrameListener> listener = std::make_unique<FrameListener>(log);
    std::unique_ptr<FrameConnection> client;
    LogChannelAnswer answer;
    milliseconds after{0};
    std::function<void()> asked;
};

template <typename World>
class TelephonyServiceContract : public testing::Test {
protected:
    auto connect()
    {
        return world.telephony.connect([this](std::string_view name) { heard.emplace_back(name); });
    }

    World world;
    std::unique_ptr<LocalPort> local = world.ports.createLocal("log", [](auto, auto) {});
    std::vector<std::string> heard;
};
using Worlds = testing::Types<MemoryWorld, SocketWorld>;
TYPED_TEST_SUITE(TelephonyServiceContract, Worlds, DoubleOrAdapter);

TYPED_TEST(TelephonyServiceContract, CannotBeReachedAfterItsEnd)
{
    this->world.goAway();
    EXPECT_FALSE(this->connect());
}

TYPED_TEST(TelephonyServiceContract, GivesTheAnswerAsItCame)
{
    for (const auto& each : {LogChannelAnswer{0, 0, "port"}, LogChannelAnswer{1, -2, std::nullopt}}) {
        this->world.serve(each);
        const auto answer = this->connect()->networkMonitorCreateLogChannel("log");
        EXPECT_EQ(answer.errorDomain, each.errorDomain);
        EXPECT_EQ(answer.errorCode, each.errorCode);
        EXPECT_EQ(answer.remotePort, each.remotePort);
    }
}

TYPED_TEST(TelephonyServiceContract, RefusesALogToAPortThatDoesNotListen)
{
    bool asked = false;
    this->world.whenAsked([&] { asked = true; });
    const auto connection = this->connect();
    EXPECT_EQ(connection->networkMonitorCreateLogChannel("other").errorCode, ENOTCONN);
    this->local->invalidate();
    const auto answer = connection->networkMonitorCreateLogChannel("log");
    EXPECT_EQ(answer.errorDomain, 2);
    EXPECT_EQ(answer.errorCode, ENOTCONN);
    EXPECT_FALSE(answer.remotePort);
    EXPECT_FALSE(asked);
}

TYPED_TEST(TelephonyServiceContract, ServesTasksWhileItWaitsAndGivesUpOnSilence)
{
    this->world.serve({0, 0, "port"}, 5s);
    int ticks = 0;
    const auto timer = this->world.queue.repeat(1ms, [&] { ++ticks; });
    const auto answer = this->connect()->networkMonitorCreateLogChannel("log");
    EXPECT_EQ(answer.errorDomain, 2);
    EXPECT_EQ(answer.errorCode, ETIMEDOUT);
    EXPECT_FALSE(answer.remotePort);
    EXPECT_GE(ticks, 3);
}

TYPED_TEST(TelephonyServiceContract, AConnectionMayEndWhileItWaits)
{
    this->world.serve({0, 0, "port"}, 5s);
    auto connection = this->connect();
    this->world.queue.post(5ms, [&] { connection.reset(); });
    const auto answer = connection->networkMonitorCreateLogChannel("log");
    EXPECT_EQ(answer.errorDomain, 2);
    EXPECT_EQ(answer.errorCode, EPIPE);
    EXPECT_FALSE(answer.remotePort);
}

TYPED_TEST(TelephonyServiceContract, NotificationsComeFromTheQueueAndEqualOnesOnce)
{
    const auto connection = this->connect();
    for (const char* each : {"one", "two", "one"})
        this->world.notify(each);
    EXPECT_THAT(this->heard, IsEmpty());
    ASSERT_TRUE(this->world.eventually([&] { return this->heard.size() >= 2; }));
    this->world.wait(5ms);
    EXPECT_THAT(this->heard, ElementsAre("one", "two"));
}

TYPED_TEST(TelephonyServiceContract, NotificationsWaitForTheEndOfTheCall)
{
    this->world.serve({0, 0, "port"}, 50ms);
    this->world.whenAsked([&] { this->world.notify("meanwhile"); });
    const auto connection = this->connect();
    EXPECT_EQ(connection->networkMonitorCreateLogChannel("log").errorCode, 0);
    EXPECT_THAT(this->heard, IsEmpty());
    EXPECT_TRUE(this->world.eventually([&] { return this->heard.size() == 1; }));
}

TYPED_TEST(TelephonyServiceContract, NoNotificationArrivesAfterTheConnectionEnds)
{
    this->world.whenAsked([&] { this->world.notify("unheard"); });
    this->world.serve({0, 0, "port"}, 5ms);
    this->connect()->networkMonitorCreateLogChannel("log");
    this->world.wait(10ms);
    EXPECT_THAT(this->heard, IsEmpty());
}

} // namespace
} // namespace kestrum
