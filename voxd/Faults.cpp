#include "voxd/Faults.h"

#include "platform/SystemLog.h"
#include "platform/TelephonyService.h"
#include "platform/posix/VoxProtocol.h"
#include "platform/qt/FrameSocket.h"
#include "support/Format.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <csignal>
#include <random>
#include <thread>

#include <poll.h>
#include <sys/socket.h>

namespace kestrum {
namespace {

using namespace std::chrono;

constexpr seconds kFlood{3}, kPatience{5};
constexpr std::size_t kStruckMessage = 20;
constexpr std::int32_t kNoMessage = 77;

std::vector<std::byte> bytesOfFrame(const Frame& frame)
{
    std::vector<std::byte> bytes;
    appendFrame(bytes, frame);
    return bytes;
}

void endConnection(FrameConnection& connection)
{
    connection.push();
    ::shutdown(connection.descriptor(), SHUT_RDWR); // the event loop then sees the closed connection
}

// Sends without delay, so that the bytes before an interruption arrive as they should. A display that does not read
// loses its connection.
bool sendNow(FrameConnection& connection, Bytes bytes)
{
    connection.push();
    const int socket = connection.descriptor();
    while (!bytes.empty()) {
        const auto count = ::send(socket, bytes.data(), bytes.size(), MSG_NOSIGNAL | MSG_DONTWAIT);
        if (count > 0) {
            bytes = bytes.subspan(static_cast<std::size_t>(count));
            continue;
        }
        pollfd room{socket, POLLOUT, 0};
        if (errno != EAGAIN || ::poll(&room, 1, static_cast<int>(milliseconds(kPatience).count())) <= 0) {
            endConnection(connection);
            return false;
        }
    }
    return true;
}

void sendLate(FrameConnection& connection, const Frame& frame, milliseconds delay)
{
    std::this_thread::sleep_for(delay);
    connection.send(frame);
}

void sendHalf(FrameConnection& connection, const Frame& frame, void (*between)(FrameConnection&))
{
    const auto whole = bytesOfFrame(frame);
    const Bytes bytes(whole);
    const auto half = bytes.size() / 2;
    if (!sendNow(connection, bytes.first(half)))
        return;
    between(connection);
    sendNow(connection, bytes.subspan(half));
}

void sendByteByByte(FrameConnection& connection, const Frame& frame)
{
    for (const std::byte& each : bytesOfFrame(frame)) {
        if (!sendNow(connection, Bytes(&each, 1)))
            return;
        std::this_thread::sleep_for(milliseconds(1)); // gives the display time to process each one
    }
}

void sendGarbage(FrameConnection& connection, const Frame&)
{
    std::array<std::byte, 4096> bytes;
    std::ranges::generate(bytes, [random = std::mt19937(1)]() mutable { return static_cast<std::byte>(random()); });
    sendNow(connection, bytes);
}

void sendOversized(FrameConnection& connection, const Frame& frame)
{
    auto bytes = bytesOfFrame(frame);
    std::fill_n(bytes.begin(), 3, std::byte{0xFF});
    bytes[3] = std::byte{0x7F};
    sendNow(connection, bytes);
}

void sendWithWrongIds(FrameConnection& connection, Frame frame)
{
    if (frame.kind == Frame::Kind::Reply)
        ++frame.serial;
    else
        frame.messageId = kNoMessage;
    connection.send(frame);
}

void sendBehindFloodOf(FrameConnection& connection, const Frame& flood, const Frame& frame)
{
    std::vector<std::byte> batch;
    while (batch.size() < std::size_t{64} << 10)
        appendFrame(batch, flood);
    for (const auto end = steady_clock::now() + kFlood; steady_clock::now() < end;)
        if (!sendNow(connection, batch))
            return;
    connection.send(frame);
}

void sendBehindRecords(FrameConnection& connection, const Frame& frame)
{
    // A record of 1000 bytes, all zero except its length and its type, which no modem uses.
    std::array<std::byte, 1000> record{std::byte{7}, std::byte{0xE7}, std::byte{3}};
    sendBehindFloodOf(connection, {Frame::Kind::Message, vox::kLogMessage, 0, record}, frame);
}

void sendBehindNotifications(FrameConnection& connection, const Frame& frame)
{
    const Frame notification{Frame::Kind::Message, vox::kNotification, 0, bytesOf("kVoxTechnologyChangedNotification")};
    sendBehindFloodOf(connection, notification, frame);
}

/// Switches to another technology and back, twice.
class UnsteadySource final : public Source {
public:
    UnsteadySource(Source& source, SystemLog& log)
        : _source(source),
          _log(log),
          _other(source.technology() == kVoxLogChannelTechnology_IFX ? kVoxLogChannelTechnology_Zephra_LTE
                                                                     : kVoxLogChannelTechnology_IFX)
    {
        _source.available = [this] { available(); };
    }
    UnsteadySource(const UnsteadySource&) = delete;
    UnsteadySource& operator=(const UnsteadySource&) = delete;
    ~UnsteadySource() override
    {
        _source.available = [] {};
    }

    std::optional<Message> next() override
    {
        auto message = _source.next();
        if (!message)
            return message;
        if (++_given == kStruckMessage)
            _log.write(Priority::Notice, "fault technology: now");
        else if (_given == kChanges * kStruckMessage)
            _log.write(Priority::Notice, "fault technology: over");
        return message;
    }
    bool isLive() const override { return _source.isLive(); }
    void streamedTo(std::size_t clients) override { _source.streamedTo(clients); }
    std::string_view technology() const override
    {
        const auto change = std::min(_given / kStruckMessage, kChanges);
        return change % 2 == 1 ? _other : _source.technology();
    }

private:
    static constexpr std::size_t kChanges = 4;

    Source& _source;
    SystemLog& _log;
    std::string_view _other;
    std::size_t _given = 0; // messages given so far
};

} // namespace

struct Faults::Fault {
    std::string_view name, summary;
    int answers, technologies, messages; ///< how many of each are affected
    void (*strike)(FrameConnection&, const Frame&);
};

const std::vector<Faults::Fault>& Faults::all()
{
    using Connection = FrameConnection;
    static const std::vector<Fault> faults{
        {"reply-900ms", "both replies 0.9 s late", 1, 1, 0,
         [](Connection& to, const Frame& frame) { sendLate(to, frame, milliseconds(900)); }},
        {"reply-1100ms", "both replies 1.1 s late", 1, 1, 0,
         [](Connection& to, const Frame& frame) { sendLate(to, frame, milliseconds(1100)); }},
        {"reply-never", "both replies are not sent", 1, 1, 0, [](Connection&, const Frame&) {}},
        {"wrong-ids", "both replies and a message with wrong ids", 1, 1, 1,
         [](Connection& to, const Frame& frame) { sendWithWrongIds(to, frame); }},
        {"half-frame", "half a message, then the end of the connection", 0, 0, 1,
         [](Connection& to, const Frame& frame) { sendHalf(to, frame, endConnection); }},
        {"byte-by-byte", "both replies and a message in single bytes", 1, 1, 1, sendByteByByte},
        {"garbage", "4,096 random bytes instead of a message", 0, 0, 1, sendGarbage},
        {"oversized", "a message with a length of 2 GiB", 0, 0, 1, sendOversized},
        {"flood", "3 s of invalid records, as fast as the display accepts them", 0, 0, 1, sendBehindRecords},
        {"notifications", "3 s of notifications before the first reply", 1, 0, 0, sendBehindNotifications},
        {"technology", "another technology and back, twice, after 20 messages each time", 0, 0, 0, nullptr},
        {"stop", "SIGSTOP in the middle of a message", 0, 0, 1,
         [](Connection& to, const Frame& frame) { sendHalf(to, frame, [](Connection&) { ::raise(SIGSTOP); }); }},
        {"die", "SIGKILL in the middle of a message", 0, 0, 1,
         [](Connection& to, const Frame& frame) { sendHalf(to, frame, [](Connection&) { ::raise(SIGKILL); }); }},
    };
    return faults;
}

std::string Faults::help()
{
    std::string lines = "Simulate faults of a service, to test displays. Each fault occurs once.\n"
                        "\"Both replies\" are the first reply to a request for a log channel and\n"
                        "the first reply to GetTechnology; \"a message\" is the 20th log message\n"
                        "after a reply to GetTechnology. The faults:";
    for (const auto& each : all())
        lines += formatted("\n%s: %s", each.name, each.summary);
    return lines;
}

bool Faults::exists(std::string_view name)
{
    return std::ranges::find(all(), name, &Fault::name) != all().end();
}

Faults::Faults(const std::vector<std::string>& names, SystemLog& log) : _log(log)
{
    for (const auto& name : names)
        std::ranges::copy_if(all(), std::back_inserter(_pending), [&](const Fault& each) { return each.name == name; });
}

Faults::~Faults() = default;

bool Faults::send(FrameConnection& connection, const Frame& frame)
{
    int Fault::*left = nullptr;
    if (frame.kind == Frame::Kind::Reply)
        left = frame.messageId == vox::kCreateLogChannel ? &Fault::answers : &Fault::technologies;
    else if (frame.messageId == vox::kLogMessage && ++_logMessages == kStruckMessage)
        left = &Fault::messages;
    if (left == &Fault::technologies)
        _logMessages = 0;
    if (left == nullptr)
        return connection.send(frame);
    const auto found = std::ranges::find_if(_pending, [&](const Fault& each) { return each.*left > 0; });
    if (found == _pending.end())
        return connection.send(frame);
    --(*found.*left);
    strike(*found, connection, frame);
    return connection.isOpen();
}

void Faults::strike(const Fault& fault, FrameConnection& connection, const Frame& frame)
{
    _log.write(Priority::Notice, "fault %s: now", fault.name);
    fault.strike(connection, frame);
    if (fault.answers + fault.technologies + fault.messages == 0)
        _log.write(Priority::Notice, "fault %s: over", fault.name);
}

std::unique_ptr<Source> Faults::unsteady(Source& source)
{
    const bool wanted = std::ranges::find(_pending, "technology", &Fault::name) != _pending.end();
    return wanted ? std::make_unique<UnsteadySource>(source, _log) : nullptr;
}

} // namespace kestrum
