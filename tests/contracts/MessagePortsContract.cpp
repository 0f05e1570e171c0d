#include "contracts/Worlds.h"
#include "doubles/MemoryPorts.h"
#include "doubles/RecordingLog.h"
#include "harness/Scratch.h"
#include "platform/qt/FrameSocket.h"
#include "platform/qt/LinuxMessagePorts.h"
#include "posix/RawSocket.h"

#include <gmock/gmock.h>

#include <cerrno>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using std::chrono::milliseconds;
using testing::ElementsAre;
using testing::IsEmpty;

/// The other process's reaction to a message.
struct Answer {
    std::optional<std::string> reply;
    milliseconds after{0};
};

struct MemoryWorld : CrankedLoop {
    MemoryPorts ports{queue};

    void serve(const std::function<Answer(std::string_view)>& with)
    {
        ports.serve("command", [with](const MemoryPorts::Request& request) {
            const auto answer = with(request.text());
            return MemoryPorts::Answer{0, answer.reply ? std::optional(Data(bytesOf(*answer.reply))) : std::nullopt,
                                       answer.after};
        });
    }
    void kill() { ports.kill("command"); }
    void send(std::int32_t id, std::string_view payload) { ports.send("log", id, payload); }
};

struct SocketWorld : QtLoop {
    ScratchDirectory directory;
    RecordingLog log;
    LinuxMessagePorts ports{directory.path(), queue, log};

    void serve(const std::function<Answer(std::string_view)>& with)
    {
        answerWith = with;
        listener = std::make_unique<FrameListener>(log);
        ASSERT_EQ(listener->listen(directory / "command"), std::nullopt);
        listener->accepted = [this](std::shared_ptr<FrameConnection> connection) {
            clients.push_back(connection);
            connection->readable = [this, weak = std::weak_ptr(connection)] { read(weak); };
        };
    }
    void kill()
    {
        listener.reset();
        clients.clear();
    }
    void send(std::int32_t id, std::string_view payload)
    {
        if (!sender)
            sender.emplace(RawSocket::connectTo(directory / ("log." + std::to_string(::getpid()))));
        sender->send(frame(kMessage, id, 0, std::string(payload)));
    }

private:
    void read(const std::weak_ptr<FrameConnection>& weak)
    {
        for (auto client = weak.lock(); client;) {
            const auto got = client->next();
            if (!got)
                return;
            const auto answer = answerWith(textOf(got->payload));
            if (answer.reply && got->kind == Frame::Kind::Request)
                queue.post(answer.after, [weak, id = got->messageId, serial = got->serial, text = *answer.reply] {
                    if (const auto to = weak.lock())
                        to->send({Frame::Kind::Reply, id, serial, bytesOf(text)});
                });
        }
    }

    std::function<Answer(std::string_view)> answerWith;
    std::unique_ptr<FrameListener> listener;
    std::vector<std::shared_ptr<FrameConnection>> clients;
    std::optional<RawSocket> sender;
};

using Received = std::pair<std::int32_t, std::string>;

template <typename World>
class LocalPortContract : public testing::Test {
protected:
    std::unique_ptr<LocalPort> make()
    {
        return world.ports.createLocal(
            "log", [this](std::int32_t id, Bytes payload) { received.emplace_back(id, textOf(payload)); });
    }
    std::unique_ptr<LocalPort> makeListening()
    {
        auto port = make();
        port->setDeliveryQueue(world.queue);
        return port;
    }
    void settle() { world.wait(10ms); }

    World world;
    std::vector<Received> received;
};
using Worlds = testing::Types<MemoryWorld, SocketWorld>;
TYPED_TEST_SUITE(LocalPortContract, Worlds, DoubleOrAdapter);

TYPED_TEST(LocalPortContract, HandsMessagesOverInTheOrderSent)
{
    const auto port = this->makeListening();
    this->world.send(0, "one");
    this->world.send(-3, "two");
    this->world.send(0, "");
    ASSERT_TRUE(this->world.eventually([&] { return this->received.size() == 3; }));
    EXPECT_THAT(this->received, ElementsAre(Received{0, "one"}, Received{-3, "two"}, Received{0, ""}));
}

TYPED_TEST(LocalPortContract, KeepsMessagesUntilItHasAQueue)
{
    const auto port = this->make();
    this->world.send(0, "early");
    this->settle();
    EXPECT_THAT(this->received, IsEmpty());
    port->setDeliveryQueue(this->world.queue);
    EXPECT_THAT(this->received, IsEmpty()) << "not within the call";
    EXPECT_TRUE(this->world.eventually([&] { return this->received.size() == 1; }));
}

TYPED_TEST(LocalPortContract, HasItsNameAloneUntilItEnds)
{
    auto port = this->make();
    ASSERT_TRUE(port);
    EXPECT_FALSE(this->make());
    port->invalidate();
    const auto second = this->make();
    EXPECT_TRUE(second);
    port.reset();
    EXPECT_FALSE(this->make()) << "the end of the first is not the end of the second";
}

TYPED_TEST(LocalPortContract, RunsItsInvalidationHandlerOnceAndLater)
{
    const auto port = this->makeListening();
    int runs = 0;
    port->setInvalidationHandler([&] { ++runs; });
    EXPECT_TRUE(port->isValid());
    port->invalidate();
    port->invalidate();
    EXPECT_FALSE(port->isValid());
    EXPECT_EQ(runs, 0) << "not within the call";
    ASSERT_TRUE(this->world.eventually([&] { return runs == 1; }));
    this->settle();
    EXPECT_EQ(runs, 1);
}

TYPED_TEST(LocalPortContract, RunsNoHandlerThatWasRemovedOrWhosePortIsDestroyed)
{
    auto port = this->makeListening();
    port->setInvalidationHandler([] { ADD_FAILURE() << "was removed"; });
    port->invalidate();
    port->setInvalidationHandler({});
    this->settle();
    port.reset();
    port = this->makeListening();
    port->setInvalidationHandler([] { ADD_FAILURE() << "its port has gone"; });
    port->invalidate();
    port.reset();
    this->settle();
}

TYPED_TEST(LocalPortContract, MayBeDestroyedInItsInvalidationHandler)
{
    auto port = this->makeListening();
    bool ran = false;
    const auto held = std::make_shared<int>(5);
    port->setInvalidationHandler([&port, &ran, held] {
        port.reset();
        ran = *held == 5;
    });
    port->invalidate();
    EXPECT_TRUE(this->world.eventually([&] { return ran; }));
}

TYPED_TEST(LocalPortContract, MayBeDestroyedInItsReceiveHandler)
{
    std::unique_ptr<LocalPort> port;
    std::vector<std::string> seen;
    port = this->world.ports.createLocal("log", [&](std::int32_t, Bytes payload) {
        port.reset();
        seen.emplace_back(textOf(payload)); // still alive
    });
    port->setDeliveryQueue(this->world.queue);
    this->world.send(0, "first");
    this->world.send(0, "second");
    ASSERT_TRUE(this->world.eventually([&] { return !seen.empty(); }));
    this->settle();
    EXPECT_THAT(seen, ElementsAre("first"));
}

TYPED_TEST(LocalPortContract, DeliversNothingAfterItsInvalidation)
{
    const auto port = this->makeListening();
    this->world.send(0, "under way");
    port->invalidate();
    this->settle();
    EXPECT_THAT(this->received, IsEmpty());
}

template <typename World>
class RemotePortContract : public testing::Test {
protected:
    void SetUp() override
    {
        world.serve([this](std::string_view text) {
            arrived.emplace_back(text);
            return answer;
        });
        port = world.ports.createRemote("command");
        ASSERT_TRUE(port);
    }
    RemotePort::Sent request(std::string_view text, milliseconds timeout = 5s)
    {
        return port->sendRequest(0, bytesOf(text), 1s, timeout, RemotePort::Reply::Awaited);
    }
    static std::optional<std::string> text(const RemotePort::Sent& sent)
    {
        return sent.reply ? std::optional(std::string(textOf(sent.reply->bytes()))) : std::nullopt;
    }

    World world;
    Answer answer{"reply"};
    std::vector<std::string> arrived;
    std::unique_ptr<RemotePort> port;
};
TYPED_TEST_SUITE(RemotePortContract, Worlds, DoubleOrAdapter);

TYPED_TEST(RemotePortContract, IsNotCreatedWithoutAListener)
{
    EXPECT_FALSE(this->world.ports.createRemote("unknown"));
    this->world.kill();
    EXPECT_FALSE(this->world.ports.createRemote("command"));
}

TYPED_TEST(RemotePortContract, SendsOneWayWithoutAReply)
{
    const auto sent = this->port->sendRequest(0, bytesOf("start"), 1s, 0ms, RemotePort::Reply::None);
    EXPECT_EQ(sent.status, 0);
    EXPECT_FALSE(sent.reply);
    EXPECT_TRUE(this->world.eventually([&] { return !this->arrived.empty(); }));
    EXPECT_THAT(this->arrived, ElementsAre("start"));
}

TYPED_TEST(RemotePortContract, GivesTheReplyEvenAnEmptyOne)
{
    for (const char* each : {"reply", ""}) {
        this->answer.reply = each;
        const auto sent = this->request("ask");
        EXPECT_EQ(sent.status, 0);
        EXPECT_EQ(this->text(sent), each);
    }
}

TYPED_TEST(RemotePortContract, GivesSuccessWithoutAReplyWhenNoneComesInTime)
{
    for (const auto& late : {Answer{}, Answer{"late", 200ms}}) {
        this->answer = late;
        const auto sent = this->request("ask", 20ms);
        EXPECT_EQ(sent.status, 0);
        EXPECT_FALSE(sent.reply);
    }
    this->answer = {"second", 300ms};
    EXPECT_EQ(this->text(this->request("again")), "second") << "the late one is thrown away";
}

TYPED_TEST(RemotePortContract, ServesTasksAndTimersWhileItWaits)
{
    int tasks = 0, ticks = 0;
    this->answer.after = 50ms;
    this->world.queue.post([&] { ++tasks; });
    const auto timer = this->world.queue.repeat(1ms, [&] { ++ticks; });
    EXPECT_EQ(this->text(this->request("ask")), "reply");
    EXPECT_EQ(tasks, 1);
    EXPECT_GE(ticks, 1);
}

TYPED_TEST(RemotePortContract, ClosedInTheWaitGivesSuccessWithoutAReply)
{
    this->answer.reply = std::nullopt;
    this->world.queue.post(5ms, [&] { this->port->invalidate(); });
    const auto sent = this->request("ask", 10s);
    EXPECT_EQ(sent.status, 0);
    EXPECT_FALSE(sent.reply);
}

TYPED_TEST(RemotePortContract, DestroyedInTheWaitGivesSuccessWithoutAReply)
{
    this->answer.reply = std::nullopt;
    this->world.queue.post(5ms, [&] { this->port.reset(); });
    const auto sent = this->request("ask", 10s);
    EXPECT_EQ(sent.status, 0);
    EXPECT_FALSE(sent.reply);
}

TYPED_TEST(RemotePortContract, ItsOwnersEndInTheWaitGivesSuccessWithoutAReply)
{
    this->answer.reply = std::nullopt;
    this->world.queue.post(50ms, [&] { this->world.kill(); });
    const auto sent = this->request("ask", 10s);
    EXPECT_EQ(sent.status, 0);
    EXPECT_FALSE(sent.reply);
    EXPECT_FALSE(this->port->isValid());
}

TYPED_TEST(RemotePortContract, ItsOwnersEndInvalidatesItAndRunsItsHandlerOnceLater)
{
    int runs = 0;
    this->port->setInvalidationHandler([&] { ++runs; });
    EXPECT_EQ(this->text(this->request("ask")), "reply");
    EXPECT_TRUE(this->port->isValid());
    this->world.kill();
    EXPECT_EQ(runs, 0);
    EXPECT_TRUE(this->world.eventually([&] { return runs == 1; }));
    EXPECT_FALSE(this->port->isValid());
}

TYPED_TEST(RemotePortContract, RefusesMessagesOnceInvalid)
{
    this->port->invalidate();
    for (const auto reply : {RemotePort::Reply::None, RemotePort::Reply::Awaited}) {
        const auto sent = this->port->sendRequest(0, bytesOf("ask"), 1s, 1s, reply);
        EXPECT_EQ(sent.status, EPIPE);
        EXPECT_FALSE(sent.reply);
    }
    EXPECT_THAT(this->arrived, IsEmpty());
}

} // namespace
} // namespace kestrum
