#include "doubles/RecordingLog.h"
#include "harness/Scratch.h"
#include "platform/TelephonyService.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "posix/RawSocket.h"
#include "qtplatform/EventLoop.h"
#include "voxd/Service.h"

#include <gmock/gmock.h>

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

TEST(ServicePace, SendsTheMessagesOfASliceOfTimeTogether)
{
    constexpr int kCount = 1000;
    const ScratchDirectory directory;
    PropertyListCodec lists;
    RecordingLog log;
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
    const auto listener = RawSocket::listenAt(directory / "log");
    const auto server = RawSocket::connectTo(directory / "org.kestrum.vox");
    ASSERT_TRUE(server.send(frame(kRequest, 1, 1, "log")));
    std::string reply;
    ASSERT_TRUE(eventually([&] { return !(reply += server.received()).empty(); }));
    constexpr std::size_t kFrameAndErrors = 13 + 8;
    const auto commands = RawSocket::connectTo(directory / reply.substr(kFrameAndErrors));
    const auto client = listener.accept();

    const auto begin = steady_clock::now();
    const auto start = lists.toXml(makeDictionary({{"SetState", Value("Streaming")}}));
    ASSERT_TRUE(commands.send(frame(kMessage, 0, 0, textOf(start->bytes()))));
    std::string expected, received;
    for (int i = 0; i < kCount; ++i)
        expected += frame(kMessage, 0, 0, DenseSource::text(i));
    EXPECT_TRUE(eventually([&] { return (received += client.received()).size() >= expected.size(); }));
    EXPECT_EQ(received, expected);
    // 20 a second are due. A turn that takes 10 ms is cut, which makes one more on a slow machine.
    EXPECT_LE(turns, static_cast<std::size_t>((steady_clock::now() - begin) / 10ms) + 2);
}

} // namespace
} // namespace kestrum
