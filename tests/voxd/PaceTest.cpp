#include "doubles/RecordingLog.h"
#include "harness/Scratch.h"
#include "platform/TelephonyService.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "posix/RawSocket.h"
#include "qtplatform/EventLoop.h"
#include "voxd/Service.h"

#include <gmock/gmock.h>

#include <deque>

namespace kestrum {
namespace {

using namespace std::chrono;
using namespace std::chrono_literals;

/// Numbered messages, 1 ms from each to the next.
class DenseSource final : public Source {
public:
    explicit DenseSource(int count) : _count(count) {}

    std::optional<Message> next() override
    {
        if (_given == _count)
            return std::nullopt;
        const Bytes bytes = bytesOf(text(_given));
        return Message{1ms * _given++, {bytes.begin(), bytes.end()}};
    }
    std::string_view technology() const override { return kVoxLogChannelTechnology_IFX; }

    static const std::string& text(int number)
    {
        static std::string kept;
        return kept = "message " + std::to_string(number);
    }

private:
    int _count, _given = 0;
};

/// Gives what the test puts into it.
class LiveSource final : public Source {
public:
    std::optional<Message> next() override
    {
        if (pending.empty())
            return std::nullopt;
        const Bytes bytes = bytesOf(pending.front());
        Message message{0us, {bytes.begin(), bytes.end()}};
        pending.pop_front();
        return message;
    }
    bool isLive() const override { return true; }
    void streamedTo(std::size_t clients) override { streams.push_back(clients); }
    std::string_view technology() const override { return kVoxLogChannelTechnology_IFX; }

    std::deque<std::string> pending;
    std::vector<std::size_t> streams;
};

class ServicePace : public testing::Test {
protected:
    /// A client of a service in this process.
    struct Client {
        RawSocket listener, commands, log;
        std::string received = {};

        void order(const std::vector<const char*>& states) const
        {
            const PropertyListCodec lists;
            std::string frames;
            for (const char* each : states)
                frames +=
                    frame(kMessage, 0, 0, textOf(lists.toXml(makeDictionary({{"SetState", Value(each)}}))->bytes()));
            ASSERT_TRUE(commands.send(frames));
        }
        bool hasReceived(const std::string& expected)
        {
            return eventually([&] { return (received += log.received()).size() >= expected.size(); }) &&
                   received == expected;
        }
    };

    Client connect(const std::string& name) const
    {
        auto listener = RawSocket::listenAt(directory / name);
        const auto server = RawSocket::connectTo(directory / "org.kestrum.vox");
        server.send(frame(kRequest, 1, 1, name));
        std::string reply;
        EXPECT_TRUE(eventually([&] { return !(reply += server.received()).empty(); }));
        constexpr std::size_t kFrameAndErrors = 13 + 8;
        auto commands = RawSocket::connectTo(directory / reply.substr(kFrameAndErrors));
        auto log = listener.accept();
        return {std::move(listener), std::move(commands), std::move(log)};
    }
    static std::string logged(const std::string& text) { return frame(kMessage, 0, 0, text); }

    const ScratchDirectory directory;
    PropertyListCodec lists;
    RecordingLog log;
};

TEST_F(ServicePace, SendsTheMessagesOfASliceOfTimeTogether)
{
    constexpr int kCount = 1000;
    DenseSource source(kCount);
    std::size_t turns = 0;
    bool inTurn = false;
    QObject context;
    Service service({.directory = directory.path()}, source, lists, log, {.streamed = [&](Bytes) {
                        if (std::exchange(inTurn, true))
                            return;
                        ++turns;
                        QTimer::singleShot(0, &context, [&] { inTurn = false; });
                    }});
    ASSERT_FALSE(service.start());
    auto client = connect("log");

    const auto begin = steady_clock::now();
    client.order({"Streaming"});
    std::string expected;
    for (int i = 0; i < kCount; ++i)
        expected += logged(DenseSource::text(i));
    EXPECT_TRUE(client.hasReceived(expected));
    // 20 a second are due. A turn that takes 10 ms is cut, which makes one more on a slow machine.
    EXPECT_LE(turns, static_cast<std::size_t>((steady_clock::now() - begin) / 10ms) + 2);
}

TEST_F(ServicePace, WaitsForALiveSourceAsLongAsItTakes)
{
    LiveSource source;
    Service service({.directory = directory.path()}, source, lists, log, {});
    service.sourceEnded = [] { FAIL() << "a live source has no end"; };
    ASSERT_FALSE(service.start());
    auto client = connect("log");
    source.available(); // before a client streams: nothing is asked for
    client.order({"Streaming"});
    ASSERT_TRUE(eventually([&] { return !source.streams.empty(); }));
    source.pending = {"one"};
    source.available();
    EXPECT_TRUE(client.hasReceived(logged("one")));
    source.pending = {"two", "three"};
    source.available();
    EXPECT_TRUE(client.hasReceived(logged("one") + logged("two") + logged("three")));
}

TEST_F(ServicePace, TellsALiveSourceHowManyClientsStream)
{
    LiveSource source;
    Service service({.directory = directory.path()}, source, lists, log, {});
    ASSERT_FALSE(service.start());
    const auto streams = [&](std::vector<std::size_t> expected) {
        return eventually([&] { return source.streams == expected; });
    };
    auto one = connect("one");
    one.order({"Streaming", "Streaming"});
    EXPECT_TRUE(streams({1}));
    {
        auto two = connect("two");
        two.order({"Streaming"});
        EXPECT_TRUE(streams({1, 2}));
    }
    EXPECT_TRUE(streams({1, 2, 1}));
    one.order({"Idle"});
    EXPECT_TRUE(streams({1, 2, 1, 0}));
}

TEST_F(ServicePace, DropsALiveMessageThatWasNotSentBeforeTheLastClientLeft)
{
    LiveSource source;
    Service service({.directory = directory.path()}, source, lists, log, {});
    ASSERT_FALSE(service.start());
    source.pending = {"old"};
    auto client = connect("log");
    client.order({"Streaming", "Idle"}); // both are read in one turn, and the message waits for the next one
    ASSERT_TRUE(eventually([&] { return source.streams.size() == 2; }));
    EXPECT_TRUE(source.pending.empty());
    source.pending = {"new"};
    client.order({"Streaming"});
    EXPECT_TRUE(client.hasReceived(logged("new")));
}

} // namespace
} // namespace kestrum
