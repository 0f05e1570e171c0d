#include "platform/qt/LinuxTelephonyService.h"

#include "platform/MainQueue.h"
#include "platform/posix/VoxProtocol.h"
#include "platform/qt/FrameSocket.h"
#include "platform/qt/LinuxMessagePorts.h"
#include "support/Format.h"

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

// A peer that sends more of them than the main queue serves gets one task, not one for each.
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
            _queue.post([weak = weak_from_this()] {
                if (const auto self = weak.lock())
                    self->handOver();
            });
    }

private:
    static constexpr std::size_t kLongestName = 256, kMostNames = 16;

    void handOver()
    {
        // The handler may end the connection, and with it what is left.
        const auto self = weak_from_this();
        constexpr int kThisTask = 1;
        for (const auto& name : std::exchange(_names, {}))
            if (_handler && self.use_count() > kThisTask)
                _handler(name);
    }

    TelephonyService::NotificationHandler _handler;
    MainQueue& _queue;
    std::vector<std::string> _names; // that wait for their turn
};

std::string ofPorts(const LinuxMessagePorts& ports)
{
    return formatted("This display cannot be reached: %s.", ports.problem().value_or(Problem()).text);
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
        return formatted("The telephony service refuses, error %d.", answer.errorCode);
    }
}

class SocketServerConnection final : public VoxServerConnection {
public:
    SocketServerConnection(std::unique_ptr<FrameConnection> connection, TelephonyService::NotificationHandler handler,
                           const LinuxMessagePorts& ports, MainQueue& queue, std::string& problem)
        : _connection(std::move(connection)),
          _notifications(std::make_shared<Notifications>(std::move(handler), queue)),
          _ports(ports),
          _problem(problem)
    {
        _connection->readable = [this] { readNotifications(); };
    }

    LogChannelAnswer networkMonitorCreateLogChannel(std::string_view serviceName) override
    {
        // Without its port the display would run and hear nothing.
        if (!_ports.isListening(serviceName)) {
            _problem = ofPorts(_ports);
            return {vox::kSystemErrors, ENOTCONN, std::nullopt};
        }
        auto answer = request(vox::addressOfPort(serviceName, ::getpid()));
        _problem = answer.errorCode == 0 ? "" : inWords(answer);
        readNotifications(); // what came behind the answer
        return answer;
    }

private:
    LogChannelAnswer request(const std::string& address)
    {
        const auto end = steady_clock::now() + kTimeout;
        const auto left = [&] { return ceil<milliseconds>(end - steady_clock::now()); };
        if (!_connection->send({Frame::Kind::Request, vox::kCreateLogChannel, ++_serial, bytesOf(address)}) ||
            !_connection->waitUntilSent(left()))
            return {vox::kSystemErrors, EPIPE, std::nullopt};
        do {
            // A flood of other frames takes no longer than silence.
            while (const auto frame = left().count() > 0 ? _connection->next() : std::nullopt) {
                if (frame->kind != Frame::Kind::Reply || frame->serial != _serial)
                    _notifications->take(*frame);
                else if (auto decoded = vox::decodeAnswer(frame->payload))
                    return *std::move(decoded);
                else
                    return {vox::kSystemErrors, EBADMSG, std::nullopt};
            }
        } while (_connection->waitForBytes(left()));
        return {vox::kSystemErrors, _connection->isOpen() ? ETIMEDOUT : EPIPE, std::nullopt};
    }

    void readNotifications()
    {
        // In turns: what is left comes with the next event.
        for (int i = 0; i < kTurn; ++i) {
            const auto frame = _connection->next();
            if (!frame)
                return;
            _notifications->take(*frame);
        }
        if (!std::exchange(_scheduled, true))
            QTimer::singleShot(0, &_context, [this] {
                _scheduled = false;
                readNotifications();
            });
    }

    static constexpr int kTurn = 256;

    std::unique_ptr<FrameConnection> _connection;
    std::shared_ptr<Notifications> _notifications;
    const LinuxMessagePorts& _ports;
    std::string& _problem;
    std::uint32_t _serial = 0;
    bool _scheduled = false; // more reading
    QObject _context;        // ends the reading with the connection
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
        _problem =
            _ports.problem() ? ofPorts(_ports) : formatted("No telephony service can be reached in %s.", _directory);
        return nullptr;
    }
    _problem.clear();
    return std::make_unique<SocketServerConnection>(std::move(connection), std::move(handler), _ports, _queue,
                                                    _problem);
}

} // namespace kestrum
