#include "doubles/RecordingLog.h"
#include "harness/Scratch.h"
#include "platform/qt/FrameSocket.h"
#include "platform/qt/LinuxMessagePorts.h"
#include "platform/qt/QtMainQueue.h"
#include "posix/RawSocket.h"
#include "qtplatform/EventLoop.h"

#include <gmock/gmock.h>

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <sys/wait.h>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

struct Received {
    std::int32_t id;
    std::string payload;
    friend bool operator==(const Received&, const Received&) = default;
    friend void PrintTo(const Received& shown, std::ostream* out) { *out << shown.id << " \"" << shown.payload << '"'; }
};

class MessagePortsTest : public testing::Test {
protected:
    std::string address(const std::string& name) const { return directory / (name + "." + std::to_string(::getpid())); }

    std::unique_ptr<LocalPort> makeLocal(const std::string& name = "log")
    {
        auto port = ports.createLocal(name, [this](std::int32_t id, Bytes payload) {
            received.push_back({id, std::string(textOf(payload))});
        });
        if (port)
            port->setDeliveryQueue(queue);
        return port;
    }

    // Runs all tasks whose time has come.
    void settle()
    {
        bool settled = false;
        queue.post(10ms, [&] { settled = true; });
        ASSERT_TRUE(eventually([&] { return settled; }));
    }

    ScratchDirectory scratch;
    ScratchDirectory directory;
    RecordingLog log;
    QtMainQueue queue;
    LinuxMessagePorts ports{directory.path(), queue, log};
    std::vector<Received> received;
};

class LocalPortTest : public MessagePortsTest {};

TEST_F(LocalPortTest, StandsInADirectoryForThisUserAlone)
{
    LinuxMessagePorts inNew(directory / "new", queue, log);
    const auto port = inNew.createLocal("log", [](auto, auto) {});
    ASSERT_TRUE(port);
    struct stat found {};
    ASSERT_EQ(::stat((directory / "new").c_str(), &found), 0);
    EXPECT_EQ(found.st_mode & 0777, 0700u);
}

TEST_F(LocalPortTest, LeavesADirectoryThatIsOpenToOthersAsItIsAndRefusesIt)
{
    for (const unsigned mode : {0755u, 0770u, 01777u, 0500u}) {
        ::chmod(directory.path().c_str(), mode);
        log.lines.clear();
        EXPECT_FALSE(makeLocal());
        EXPECT_THAT(log.errors(), ElementsAre(HasSubstr("but 0700 is needed")));
        struct stat found {};
        ASSERT_EQ(::stat(directory.path().c_str(), &found), 0);
        EXPECT_EQ(found.st_mode & 07777, mode);
    }
    ::chmod(directory.path().c_str(), 0700);
}

TEST_F(LocalPortTest, IsNotCreatedInALinkedDirectory)
{
    std::filesystem::create_directory_symlink(scratch.path(), directory / "link");
    for (const auto* name : {"link", "link/", "link//"}) {
        log.lines.clear();
        LinuxMessagePorts linked(directory / name, queue, log);
        EXPECT_FALSE(linked.createLocal("log", [](auto, auto) {})) << name;
        EXPECT_THAT(log.errors(), ElementsAre(HasSubstr("is not a directory")));
    }
}

TEST_F(LocalPortTest, IsNotMadeUnderANameThatLeavesTheDirectory)
{
    for (const char* name : {"../log", "/tmp/log", "", ".hidden", "a b"})
        EXPECT_FALSE(ports.createLocal(name, [](auto, auto) {})) << name;
    EXPECT_EQ(log.errors().size(), 5u);
}

TEST_F(LocalPortTest, SaysThatAPathIsTooLongForASocket)
{
    EXPECT_FALSE(makeLocal(std::string(120, 'x')));
    EXPECT_THAT(log.errors(), ElementsAre(HasSubstr("too long for a socket")));
}

TEST_F(LocalPortTest, GivesUpOnALockThatAnotherProcessKeeps)
{
    const int kept = ::open(directory.path().c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    ASSERT_EQ(::flock(kept, LOCK_EX), 0);
    EXPECT_FALSE(makeLocal()); // would block here
    EXPECT_THAT(log.errors(), ElementsAre(HasSubstr("another process holds the lock of " + directory.path())));
    ::close(kept);
    EXPECT_TRUE(makeLocal());
}

TEST_F(LocalPortTest, IsNotMadeTwiceInAProcess)
{
    const auto first = makeLocal();
    ASSERT_TRUE(first);
    EXPECT_FALSE(makeLocal());
    EXPECT_THAT(log.errors(), ElementsAre(HasSubstr("another process listens")));
}

TEST_F(LocalPortTest, CanBeCreatedAgainRightAfterTheFirstIsDestroyed)
{
    auto port = makeLocal();
    port.reset();
    EXPECT_FALSE(std::filesystem::exists(address("log")));
    port = makeLocal();
    EXPECT_TRUE(port);
}

TEST_F(LocalPortTest, RemovesTheSocketsOfEndedProcesses)
{
    RawSocket::listenAt(directory / "log.1").close();
    RawSocket::listenAt(address("log")).close(); // left over from an earlier process with this number
    const auto living = RawSocket::listenAt(directory / "log.2");
    RawSocket::listenAt(directory / "logbook.1").close();
    ASSERT_TRUE(makeLocal());
    EXPECT_FALSE(std::filesystem::exists(directory / "log.1"));
    EXPECT_TRUE(std::filesystem::exists(directory / "log.2"));
    EXPECT_TRUE(std::filesystem::exists(directory / "logbook.1")) << "another port's";
}

TEST_F(LocalPortTest, AMalformedFrameClosesThatPeerAloneWithOneLine)
{
    const auto port = makeLocal();
    const auto good = RawSocket::connectTo(address("log")), bad = RawSocket::connectTo(address("log"));
    good.send(frame(kMessage, 0, 0, "before"));
    bad.send(frame(kMessage, 0, 0, "last") + "\xFF\xFF\xFF\xFF" + frame(kMessage, 0, 0, "never"));
    ASSERT_TRUE(eventually([&] { return bad.isAbandoned(); }));
    good.send(frame(kMessage, 0, 0, "after"));
    ASSERT_TRUE(eventually([&] { return received.size() == 3; }));
    EXPECT_THAT(received,
                testing::UnorderedElementsAre(Received{0, "before"}, Received{0, "last"}, Received{0, "after"}));
    EXPECT_THAT(log.errors(), ElementsAre(HasSubstr("closed the connection of process " + std::to_string(::getpid()) +
                                                    ": a frame of 4294967295 bytes")));
    EXPECT_FALSE(good.isAbandoned());
    EXPECT_TRUE(port->isValid());
}

TEST_F(LocalPortTest, ASilentPeerAndHalfAFrameDelayNoOtherPeer)
{
    const auto port = makeLocal();
    const auto silent = RawSocket::connectTo(address("log")), half = RawSocket::connectTo(address("log"));
    half.send(frame(kMessage, 0, 0, "incomplete").substr(0, 15));
    const auto good = RawSocket::connectTo(address("log"));
    good.send(frame(kMessage, 0, 0, "served"));
    ASSERT_TRUE(eventually([&] { return !received.empty(); }));
    EXPECT_THAT(received, ElementsAre(Received{0, "served"}));
    half.send(frame(kMessage, 0, 0, "incomplete").substr(15));
    ASSERT_TRUE(eventually([&] { return received.size() == 2; }));
    EXPECT_EQ(received[1].payload, "incomplete");
    EXPECT_THAT(log.lines, IsEmpty());
}

TEST_F(LocalPortTest, TakesWhatASenderSentBeforeItWent)
{
    const auto port = makeLocal();
    std::string flood;
    for (int i = 0; i < 2000; ++i)
        flood += frame(kMessage, 0, 0, std::to_string(i));
    {
        auto peer = RawSocket::connectTo(address("log"));
        ASSERT_TRUE(peer.send(flood));
    }
    ASSERT_TRUE(eventually([&] { return received.size() == 2000; }));
    EXPECT_EQ(received.back().payload, "1999");
}

TEST_F(LocalPortTest, TakesAMessageLargerThanWhatIsReadAhead)
{
    const auto port = makeLocal();
    const auto peer = RawSocket::connectTo(address("log"));
    const std::string bytes = frame(kMessage, 0, 0, std::string(5 << 20, 'y'));
    for (std::size_t sent = 0; sent < bytes.size();) {
        const auto n = peer.sendSome(std::string_view(bytes).substr(sent));
        sent += n > 0 ? static_cast<std::size_t>(n) : 0;
        QCoreApplication::processEvents();
    }
    ASSERT_TRUE(eventually([&] { return !received.empty(); }));
    EXPECT_EQ(received[0].payload.size(), std::size_t{5} << 20);
}

TEST_F(LocalPortTest, AFloodLeavesTimersAndOtherSendersTheirTurns)
{
    int handled = 0, ofTheOther = 0, ticks = 0;
    // Slow enough that the messages of one read keep the handler busy for long.
    const auto port = ports.createLocal("log", [&](std::int32_t id, Bytes) {
        ++(id == 0 ? handled : ofTheOther);
        const auto end = std::chrono::steady_clock::now() + 200us;
        while (std::chrono::steady_clock::now() < end)
            continue;
    });
    port->setDeliveryQueue(queue);
    const auto flooding = RawSocket::connectTo(address("log")), other = RawSocket::connectTo(address("log"));
    const std::string flood = [] {
        std::string bytes;
        for (int i = 0; i < 2000; ++i)
            bytes += frame(kMessage, 0, 0, "flood");
        return bytes;
    }();
    ASSERT_TRUE(flooding.send(flood));
    other.send(frame(kMessage, 1, 0, "me too"));
    auto longest = 0ns;
    auto last = std::chrono::steady_clock::now();
    QTimer timer;
    QObject::connect(&timer, &QTimer::timeout, [&] {
        ++ticks;
        longest = std::max<std::chrono::nanoseconds>(longest, std::chrono::steady_clock::now() - last);
        last = std::chrono::steady_clock::now();
    });
    timer.start(1);
    ASSERT_TRUE(eventually([&] { return ofTheOther == 1; }));
    EXPECT_LT(handled, 1000) << "the other sender waited for the whole flood";
    ASSERT_TRUE(eventually([&] { return handled == 2000; }));
    EXPECT_GE(ticks, 5) << "400 ms of messages, in batches of at most 50 ms";
    // 50 ms are promised; the rest allows for a busy machine.
    EXPECT_LT(longest, 400ms);
}

TEST_F(LocalPortTest, RefusesAProcessOfAnotherUser)
{
    if (::geteuid() != 0)
        GTEST_SKIP() << "only root can become another user";
    const auto port = makeLocal();
    // The directory would keep the other user out. It is opened here, so that only the credentials do.
    ::chmod(directory.path().c_str(), 0777);
    ::chmod(address("log").c_str(), 0777);
    const std::string path = address("log");
    const pid_t child = ::fork();
    if (child == 0) {
        const bool connected = ::setresuid(65534, 65534, 65534) == 0 && [&] {
            const auto peer = RawSocket::connectTo(path);
            if (!peer.isOpen())
                return false;
            peer.send(frame(kMessage, 0, 0, "let me in"));
            return peer.receive(1).empty(); // until the connection is closed
        }();
        ::_exit(connected ? 0 : 1);
    }
    int status = -1;
    ASSERT_TRUE(eventually([&] { return ::waitpid(child, &status, WNOHANG) == child; }));
    EXPECT_EQ(status, 0);
    settle();
    EXPECT_THAT(received, IsEmpty());
    EXPECT_THAT(log.errors(), ElementsAre(HasSubstr("refused process " + std::to_string(child) + " of user 65534")));
}

/// The peer of a remote port: a listener whose answers the test sends.
class RemotePortTest : public MessagePortsTest {
protected:
    void SetUp() override
    {
        ASSERT_FALSE(listener.listen(directory / "command"));
        listener.accepted = [this](auto connection) {
            service = std::move(connection);
            service->readable = [this] {
                while (service) {
                    const auto each = service->next();
                    if (!each)
                        return;
                    arrived.push_back({each->messageId, std::string(textOf(each->payload))});
                    if (answer)
                        answer(*each);
                }
            };
        };
        port = ports.createRemote("command");
        ASSERT_TRUE(port);
        ASSERT_TRUE(eventually([&] { return service != nullptr; }));
    }

    void reply(const Frame& to, std::string_view payload)
    {
        service->send({Frame::Kind::Reply, to.messageId, to.serial, bytesOf(payload)});
    }
    RemotePort::Sent request(std::string_view payload, std::chrono::milliseconds receiveTimeout = 5s)
    {
        return port->sendRequest(0, bytesOf(payload), 1s, receiveTimeout, RemotePort::Reply::Awaited);
    }

    FrameListener listener{log};
    std::unique_ptr<FrameConnection> service;
    std::vector<Received> arrived;
    std::function<void(const Frame&)> answer;
    std::unique_ptr<RemotePort> port;
};

TEST_F(MessagePortsTest, ARemotePortIsNotCreatedWithoutAListener)
{
    EXPECT_FALSE(ports.createRemote("unknown"));
    RawSocket::listenAt(directory / "gone").close();
    EXPECT_FALSE(ports.createRemote("gone"));
    EXPECT_FALSE(ports.createRemote("../elsewhere"));
    EXPECT_FALSE(ports.createRemote(""));
}

TEST_F(RemotePortTest, ServesTimersAndMessagesWhileItWaits)
{
    const auto local = makeLocal();
    const auto peer = RawSocket::connectTo(address("log"));
    peer.send(frame(kMessage, 0, 0, "meanwhile"));
    Frame held{};
    answer = [&](const Frame& each) { held = each; };
    int ticks = 0;
    const auto timer = queue.repeat(1ms, [&] {
        if (++ticks > 3 && !received.empty() && held.serial != 0)
            reply(std::exchange(held, {}), "done");
    });
    EXPECT_TRUE(request("question").reply);
    EXPECT_THAT(received, ElementsAre(Received{0, "meanwhile"}));
    EXPECT_GT(ticks, 3);
}

TEST_F(RemotePortTest, TellsTheRepliesOfNestedRequestsApart)
{
    std::vector<Frame> asked;
    answer = [&](const Frame& each) {
        asked.push_back(each);
        if (asked.size() == 2) { // the outer request's answer first
            reply(asked[0], "outer");
            reply(asked[1], "inner");
        }
    };
    std::optional<RemotePort::Sent> inner;
    queue.post([&] { inner = request("inner question"); });
    const auto outer = request("outer question");
    ASSERT_TRUE(inner && inner->reply && outer.reply);
    EXPECT_EQ(textOf(inner->reply->bytes()), "inner");
    EXPECT_EQ(textOf(outer.reply->bytes()), "outer");
}

TEST_F(RemotePortTest, BecomesInvalidWhenItsOwnerGoesAndEndsTheWait)
{
    int invalidations = 0;
    port->setInvalidationHandler([&] { ++invalidations; });
    answer = [&](const Frame&) { service.reset(); };
    const auto before = std::chrono::steady_clock::now();
    const auto sent = request("question", 20s);
    EXPECT_FALSE(sent.reply);
    EXPECT_LT(std::chrono::steady_clock::now() - before, 10s);
    EXPECT_FALSE(port->isValid());
    ASSERT_TRUE(eventually([&] { return invalidations == 1; }));
    EXPECT_NE(port->sendRequest(0, bytesOf("more"), 1s, 0ms, RemotePort::Reply::None).status, 0);
}

TEST_F(RemotePortTest, OwnersDeathLeavesTheLocalPortAlone)
{
    const auto local = makeLocal();
    service.reset();
    ASSERT_TRUE(eventually([&] { return !port->isValid(); }));
    EXPECT_TRUE(local->isValid());
}

TEST_F(RemotePortTest, TakesTheReplyThatCameJustBeforeItsOwnerWent)
{
    answer = [&](const Frame& each) {
        reply(each, "last words");
        service->waitUntilSent(1s);
        service.reset();
    };
    const auto sent = request("question");
    ASSERT_TRUE(sent.reply);
    EXPECT_EQ(textOf(sent.reply->bytes()), "last words");
}

TEST_F(RemotePortTest, AMalformedReplyInvalidatesWithOneLine)
{
    // A listener sends only valid frames, so this peer is a plain socket.
    const auto raw = RawSocket::listenAt(directory / "rude");
    auto rude = ports.createRemote("rude");
    const auto peer = raw.accept();
    peer.send(std::string("\0\0\0\0", 4));
    ASSERT_TRUE(eventually([&] { return !rude->isValid(); }));
    EXPECT_THAT(log.errors(), ElementsAre(HasSubstr("Port rude: closed the connection")));
}

TEST_F(RemotePortTest, GivesUpOnAnOwnerThatDoesNotReadWithinTheSendTimeout)
{
    const auto raw = RawSocket::listenAt(directory / "deaf");
    const auto deaf = ports.createRemote("deaf");
    const auto peer = raw.accept();
    const std::string large(4 << 20, 'z');
    const auto before = std::chrono::steady_clock::now();
    const auto sent = deaf->sendRequest(0, bytesOf(large), 100ms, 0ms, RemotePort::Reply::None);
    EXPECT_EQ(sent.status, ETIMEDOUT);
    EXPECT_GE(std::chrono::steady_clock::now() - before, 100ms);
    EXPECT_LT(std::chrono::steady_clock::now() - before, 10s);
    EXPECT_FALSE(deaf->isValid()) << "half a frame cannot be taken back";
}

TEST_F(RemotePortTest, RefusesAPayloadAboveTheBound)
{
    const std::string tooLarge((16 << 20) + 1, 'z');
    EXPECT_EQ(port->sendRequest(0, bytesOf(tooLarge), 1s, 0ms, RemotePort::Reply::None).status, EMSGSIZE);
    EXPECT_TRUE(port->isValid());
}

TEST_F(RemotePortTest, MayBeDestroyedInItsInvalidationHandler)
{
    bool ran = false;
    port->setInvalidationHandler([&] {
        port.reset();
        ran = true;
    });
    service.reset();
    EXPECT_TRUE(eventually([&] { return ran; }));
}

class FrameConnectionAttemptTest : public MessagePortsTest {
protected:
    std::unique_ptr<FrameConnectionAttempt> attempt(std::chrono::milliseconds timeout)
    {
        return std::make_unique<FrameConnectionAttempt>(directory / "port", timeout, log, [this](auto connection) {
            made = std::move(connection);
            ++ended;
        });
    }

    std::unique_ptr<FrameConnection> made;
    int ended = 0;
};

TEST_F(FrameConnectionAttemptTest, ConnectsFromTheEventLoop)
{
    const auto listening = RawSocket::listenAt(directory / "port");
    const auto running = attempt(1s);
    EXPECT_EQ(ended, 0);
    ASSERT_TRUE(eventually([&] { return ended > 0; }));
    ASSERT_TRUE(made);
    const auto peer = listening.accept();
    made->send({Frame::Kind::Message, 7, 0, {}});
    ASSERT_TRUE(made->waitUntilSent(1s));
    EXPECT_EQ(peer.receive(13), frame(kMessage, 7, 0, ""));
}

TEST_F(FrameConnectionAttemptTest, EndsUnconnectedWithoutAListener)
{
    const auto running = attempt(20s);
    ASSERT_TRUE(eventually([&] { return ended > 0; }));
    EXPECT_FALSE(made);
}

TEST_F(FrameConnectionAttemptTest, WaitsForRoomInAFullBacklogWhileTheLoopRuns)
{
    const auto listening = RawSocket::listenAt(directory / "port", 0);
    const auto first = RawSocket::connectTo(directory / "port");
    const auto running = attempt(20s);
    settle();
    EXPECT_EQ(ended, 0);
    const auto accepted = listening.accept();
    ASSERT_TRUE(eventually([&] { return ended > 0; }));
    EXPECT_TRUE(made);
}

TEST_F(FrameConnectionAttemptTest, GivesUpOnABacklogThatStaysFull)
{
    const auto listening = RawSocket::listenAt(directory / "port", 0);
    const auto first = RawSocket::connectTo(directory / "port");
    const auto running = attempt(50ms);
    ASSERT_TRUE(eventually([&] { return ended > 0; }));
    EXPECT_FALSE(made);
}

TEST_F(FrameConnectionAttemptTest, MayBeCancelledAndMayEndWithinItsOwnCall)
{
    const auto listening = RawSocket::listenAt(directory / "port");
    attempt(1s).reset();
    settle();
    EXPECT_EQ(ended, 0);

    std::unique_ptr<FrameConnectionAttempt> running;
    running = std::make_unique<FrameConnectionAttempt>(directory / "port", 1s, log, [&](auto) {
        running.reset();
        ++ended;
    });
    EXPECT_TRUE(eventually([&] { return ended == 1; }));
}

} // namespace
} // namespace kestrum
