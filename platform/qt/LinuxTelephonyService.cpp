#include "platform/qt/LinuxTelephonyService.h"

#include "platform/MainQueue.h"
#include "platform/posix/VoxProtocol.h"
#include "platform/qt/FrameSocket.h"
#include "platform/qt/LinuxMessagePorts.h"
#include "support/Format.h"

#include <QEventLoop>
#include <QTimer>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <utility>
#include <vector>

#include <unistd.h>

namespace kestrum {
namespace {

using namespace std::chrono;

constexpr milliseconds kTimeout{1000};

// Notifications waiting for the main queue. One task delivers all of them, so a peer cannot fill the queue.
class Notifications : public std::enable_shared_from_this<Notifications> {
public:
    Notifications(TelephonyService::NotificationHandler handler, MainQueue& queue)
        : _handler(std::move(handler)), _queue(queue)
    {}

    void take(const Frame& frame)
    {
        if (frame.kind != Frame::Kind::Message || frame.messageId != vox::kNotification ||
            frame.payload.size() > kLongestName)
            return;
        auto name = std::string(textOf(frame.payload));
        if (_names.size() == kMostNames || std::ranges::find(_names, name) != _names.end())
            return;
        _names.push_back(std::move(name));
        if (_names.size() == 1)
            post();
    }

    // The wait for an answer serves the queue; the handler is not called during the wait.
    void hold() { _held = true; }
    void release()
    {
        _held = false;
        if (!_names.empty())
            post();
    }

private:
    static constexpr std::size_t kLongestName = 256, kMostNames = 16;

    void post()
    {
        _queue.post([weak = weak_from_this()] {
            if (const auto self = weak.lock())
                self->handOver();
        });
    }

    void handOver()
    {
        if (_held)
            return;
        // The handler may end the connection and with it the remaining notifications.
        const auto self = weak_from_this();
        constexpr int kThisTask = 1;
        for (const auto& name : std::exchange(_names, {}))
            if (_handler && self.use_count() > kThisTask)
                _handler(name);
    }

    TelephonyService::NotificationHandler _handler;
    MainQueue& _queue;
    std::vector<std::string> _names; // not yet delivered
    bool _held = false;
};

Problem ofPorts(const LinuxMessagePorts& ports)
{
    return {formatted("This display cannot be reached: %s.", ports.problem().value_or(Problem()).text)};
}

std::string inWords(const LogChannelAnswer& answer)
{
    if (answer.errorDomain == vox::kSystemErrors)
        return answer.errorCode == ETIMEDOUT
                   ? "The telephony service does not answer."
                   : formatted("The telephony service fails: %s.", std::strerror(answer.errorCode));
    switch (answer.errorCode) {
    case vox::kTooManyChannels:
        return "The telephony service has no channel left for this display.";
    case vox::kNoReceiver:
        return "The telephony service cannot reach this display.";
    default:
        return formatted("The telephony service refuses the request: error %d.", answer.errorCode);
    }
}

// A connection's socket and the pending answer. The wait for it serves tasks, which may end the connection.
struct Link {
    struct Awaited {
        explicit Awaited(std::uint32_t as) : serial(as) {}

        std::uint32_t serial;
        QEventLoop loop;
        std::optional<LogChannelAnswer> answer;
    };

    Link(std::unique_ptr<FrameConnection> with, TelephonyService::NotificationHandler handler, MainQueue& queue)
        : connection(std::move(with)), notifications(std::make_shared<Notifications>(std::move(handler), queue))
    {
        connection->readable = [this] { read(); };
        connection->closed = [this] {
            read(); // the answer may have arrived already
            quit();
        };
    }

    LogChannelAnswer request(const std::string& address)
    {
        Awaited reply(++lastSerial);
        if (!connection->send({Frame::Kind::Request, vox::kCreateLogChannel, reply.serial, bytesOf(address)}))
            return failure(EPIPE);
        notifications->hold();
        awaited = &reply;
        QTimer::singleShot(kTimeout, Qt::PreciseTimer, &reply.loop, &QEventLoop::quit);
        reply.loop.exec();
        awaited = nullptr;
        notifications->release();
        if (reply.answer)
            return *std::move(reply.answer);
        return failure(connection && connection->isOpen() ? ETIMEDOUT : EPIPE);
    }

    // Reads a bounded number of frames for each event, so that a flood does not block the loop. After the peer has
    // closed no further event comes; then all remaining frames are read, and their number is bounded.
    void read()
    {
        for (int i = 0; i < kTurn || !connection->isOpen(); ++i) {
            const auto frame = connection->next();
            if (!frame)
                return;
            take(*frame);
        }
        if (!std::exchange(scheduled, true))
            QTimer::singleShot(0, context.get(), [this] {
                scheduled = false;
                read();
            });
    }

    void take(const Frame& frame)
    {
        if (awaited == nullptr || awaited->answer || frame.kind != Frame::Kind::Reply ||
            frame.serial != awaited->serial)
            return notifications->take(frame);
        auto decoded = vox::decodeAnswer(frame.payload);
        awaited->answer = decoded ? *std::move(decoded) : failure(EBADMSG);
        quit();
    }

    void quit()
    {
        if (awaited != nullptr)
            awaited->loop.quit();
    }

    void close()
    {
        context.reset();
        connection.reset();
        quit();
    }

    static LogChannelAnswer failure(int number) { return {vox::kSystemErrors, number, std::nullopt}; }

    static constexpr int kTurn = 256;

    std::unique_ptr<FrameConnection> connection;
    std::shared_ptr<Notifications> notifications;
    Awaited* awaited = nullptr;
    std::uint32_t lastSerial = 0;
    bool scheduled = false;                                         // another read is scheduled
    std::unique_ptr<QObject> context = std::make_unique<QObject>(); // its end cancels the scheduled read
};

class SocketServerConnection final : public VoxServerConnection {
public:
    SocketServerConnection(std::shared_ptr<Link> link, const LinuxMessagePorts& ports, std::optional<Problem>& problem)
        : _link(std::move(link)), _ports(ports), _problem(problem)
    {}
    ~SocketServerConnection() override { _link->close(); }

    LogChannelAnswer networkMonitorCreateLogChannel(std::string_view serviceName) override
    {
        // Without a receive port the display would run without messages.
        if (!_ports.isListening(serviceName)) {
            _problem = ofPorts(_ports);
            return Link::failure(ENOTCONN);
        }
        // The wait may destroy this connection.
        const auto link = _link;
        auto& problem = _problem;
        auto answer = link->request(vox::addressOfPort(serviceName, ::getpid()));
        problem = answer.errorCode == 0 ? std::nullopt : std::optional(Problem{inWords(answer)});
        return answer;
    }

private:
    std::shared_ptr<Link> _link;
    const LinuxMessagePorts& _ports;
    std::optional<Problem>& _problem;
};

} // namespace

LinuxTelephonyService::LinuxTelephonyService(std::string directory, const LinuxMessagePorts& ports, MainQueue& queue,
                                             SystemLog& log)
    : _directory(std::move(directory)), _ports(ports), _queue(queue), _log(log)
{}

std::unique_ptr<VoxServerConnection> LinuxTelephonyService::connect(NotificationHandler handler)
{
    auto connection = FrameConnection::connectTo(_directory + "/" + std::string(vox::kServerPort), kTimeout, _log);
    if (!connection) {
        _problem = _ports.problem() ? ofPorts(_ports)
                                    : Problem{formatted("No telephony service can be reached in %s.", _directory)};
        return nullptr;
    }
    _problem.reset();
    return std::make_unique<SocketServerConnection>(
        std::make_shared<Link>(std::move(connection), std::move(handler), _queue), _ports, _problem);
}

} // namespace kestrum
