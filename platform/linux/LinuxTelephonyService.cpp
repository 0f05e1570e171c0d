#include "platform/linux/LinuxTelephonyService.h"

#include "platform/MainQueue.h"
#include "platform/linux/FrameSocket.h"
#include "platform/linux/VoxProtocol.h"

#include <cerrno>

#include <unistd.h>

namespace kestrum {
namespace {

using namespace std::chrono;

constexpr milliseconds kTimeout{1000};

class SocketServerConnection final : public VoxServerConnection {
public:
    SocketServerConnection(std::unique_ptr<FrameConnection> connection, TelephonyService::NotificationHandler handler,
                           MainQueue& queue)
        : _connection(std::move(connection)),
          _handler(std::make_shared<TelephonyService::NotificationHandler>(std::move(handler))),
          _queue(queue)
    {
        _connection->readable = [this] { readNotifications(); };
    }

    LogChannelAnswer networkMonitorCreateLogChannel(std::string_view serviceName) override
    {
        const auto end = steady_clock::now() + kTimeout;
        const auto left = [&] { return ceil<milliseconds>(end - steady_clock::now()); };
        const auto address = vox::addressOfPort(serviceName, ::getpid());
        auto answer = [&]() -> LogChannelAnswer {
            if (!_connection->send({Frame::Kind::Request, vox::kCreateLogChannel, ++_serial, bytesOf(address)}) ||
                !_connection->waitUntilSent(left()))
                return {vox::kSystemErrors, EPIPE, std::nullopt};
            do {
                while (const auto frame = _connection->next()) {
                    if (frame->kind != Frame::Kind::Reply || frame->serial != _serial)
                        notify(*frame);
                    else if (auto decoded = vox::decodeAnswer(frame->payload))
                        return *std::move(decoded);
                    else
                        return {vox::kSystemErrors, EBADMSG, std::nullopt};
                }
            } while (_connection->waitForBytes(left()));
            return {vox::kSystemErrors, _connection->isOpen() ? ETIMEDOUT : EPIPE, std::nullopt};
        }();
        readNotifications(); // what came behind the answer
        return answer;
    }

private:
    void readNotifications()
    {
        while (const auto frame = _connection->next())
            notify(*frame);
    }

    void notify(const Frame& frame)
    {
        if (frame.kind != Frame::Kind::Message || frame.messageId != vox::kNotification)
            return;
        // The connection's end lets go of the handler, and so of what is still queued.
        _queue.post([weak = std::weak_ptr(_handler), name = std::string(textOf(frame.payload))] {
            if (const auto handler = weak.lock(); handler && *handler)
                (*handler)(name);
        });
    }

    std::unique_ptr<FrameConnection> _connection;
    std::shared_ptr<TelephonyService::NotificationHandler> _handler;
    MainQueue& _queue;
    std::uint32_t _serial = 0;
};

} // namespace

LinuxTelephonyService::LinuxTelephonyService(std::string directory, MainQueue& queue, SystemLog& log)
    : _directory(std::move(directory)), _queue(queue), _log(log)
{}

std::unique_ptr<VoxServerConnection> LinuxTelephonyService::connect(NotificationHandler handler)
{
    auto connection = FrameConnection::connectTo(_directory + "/" + std::string(vox::kServerPort), kTimeout, _log);
    if (!connection)
        return nullptr;
    return std::make_unique<SocketServerConnection>(std::move(connection), std::move(handler), _queue);
}

} // namespace kestrum
