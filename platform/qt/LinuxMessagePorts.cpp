#include "platform/qt/LinuxMessagePorts.h"

#include "platform/MainQueue.h"
#include "platform/SystemLog.h"
#include "platform/posix/RuntimeDirectory.h"
#include "platform/posix/VoxProtocol.h"
#include "platform/qt/FrameSocket.h"
#include "support/Format.h"

#include <QEventLoop>
#include <QTimer>

#include <algorithm>
#include <cerrno>
#include <map>
#include <utility>

#include <unistd.h>

namespace kestrum {
namespace {

using namespace std::chrono;

// Messages are delivered for this long before timers and the interface get a turn.
constexpr milliseconds kBatch{20};
// Messages taken from one sender before the next gets a turn.
constexpr int kTurn = 16;
constexpr std::size_t kMaximumSenders = 64;
constexpr milliseconds kConnectTimeout{1000};

// A port's validity and its invalidation handler, which runs at most once, from the main queue. Shared, because tasks
// and stack frames may outlive the port.
struct Validity : std::enable_shared_from_this<Validity> {
    explicit Validity(MainQueue& on) : queue(on) {}

    void end()
    {
        if (!std::exchange(valid, false))
            return;
        queue.post([weak = weak_from_this()] {
            if (const auto self = weak.lock())
                if (const auto run = std::exchange(self->handler, {}))
                    run();
        });
    }

    MainQueue& queue;
    bool valid = true;
    std::function<void()> handler;
};

struct Receiver : std::enable_shared_from_this<Receiver> {
    Receiver(MessagePorts::ReceiveHandler with, SystemLog& log) : handler(std::move(with)), listener(log) {}

    void take(std::unique_ptr<FrameConnection> connection)
    {
        if (senders.size() == kMaximumSenders)
            return;
        // A sender that has closed is kept until its remaining messages are delivered.
        connection->readable = connection->closed = [this] { schedule(); };
        senders.push_back(std::move(connection));
        schedule();
    }

    // Schedules a delivery: messages may have arrived.
    void schedule()
    {
        if (queue == nullptr)
            return;
        switch (state) {
        case State::Idle:
            state = State::Scheduled;
            queue->post([weak = weak_from_this()] {
                if (const auto self = weak.lock(); self && self->state == State::Scheduled)
                    self->deliver();
            });
            break;
        case State::Delivering:
            state = State::DeliveringAndMoreCame;
            break;
        case State::Scheduled:
        case State::DeliveringAndMoreCame:
        case State::Closed:
            break;
        }
    }

    void deliver()
    {
        state = State::Delivering;
        const auto end = steady_clock::now() + kBatch;
        bool more = true;
        while (more && isOpen() && steady_clock::now() < end) {
            more = false;
            // By index: the handler may run a nested event loop that adds senders.
            for (std::size_t i = 0; i < senders.size() && isOpen(); ++i)
                more |= deliverFrom(i);
            std::erase(senders, nullptr);
        }
        if (!isOpen())
            return;
        more |= state == State::DeliveringAndMoreCame;
        state = State::Idle;
        if (more)
            schedule();
    }

    // Delivers one sender's turn; true when the sender may have more messages.
    bool deliverFrom(std::size_t index)
    {
        const auto sender = senders[index]; // a copy: the handler borrows its bytes and may close the port
        for (int i = 0; i < kTurn; ++i) {
            const auto frame = sender->next();
            if (!frame) {
                if (!sender->isOpen())
                    senders[index].reset();
                return false;
            }
            if (frame->kind == Frame::Kind::Message)
                handler(frame->messageId, frame->payload);
            if (!isOpen())
                return false;
        }
        return true;
    }

    bool isOpen() const { return state != State::Closed; }

    void close()
    {
        state = State::Closed;
        listening.reset();
        listener.close();
        senders.clear();
    }

    MessagePorts::ReceiveHandler handler;
    FrameListener listener;
    std::shared_ptr<const void> listening; // not null while new senders can connect
    std::vector<std::shared_ptr<FrameConnection>> senders;
    MainQueue* queue = nullptr;
    // Deliveries can nest: a handler may run a nested event loop.
    enum class State { Idle, Scheduled, Delivering, DeliveringAndMoreCame, Closed } state = State::Idle;
};

class SocketLocalPort final : public LocalPort {
public:
    SocketLocalPort(std::shared_ptr<Receiver> receiver, MainQueue& queue)
        : _receiver(std::move(receiver)), _validity(std::make_shared<Validity>(queue))
    {}
    ~SocketLocalPort() override { _receiver->close(); }

    bool isValid() const override { return _validity->valid; }
    void invalidate() override
    {
        _receiver->close();
        _validity->end();
    }
    void setInvalidationHandler(std::function<void()> handler) override { _validity->handler = std::move(handler); }
    void setDeliveryQueue(MainQueue& queue) override
    {
        _receiver->queue = &queue;
        _receiver->schedule();
    }

private:
    std::shared_ptr<Receiver> _receiver;
    std::shared_ptr<Validity> _validity;
};

// The connection of a remote port and its pending replies.
struct Sender {
    explicit Sender(MainQueue& queue) : validity(std::make_shared<Validity>(queue)) {}

    struct Awaited {
        QEventLoop loop;
        std::optional<Data> reply;
    };

    void read()
    {
        while (connection) {
            const auto frame = connection->next();
            if (!frame)
                return;
            // A reply without a pending request arrived too late and is dropped.
            const auto found = awaited.find(frame->serial);
            if (frame->kind != Frame::Kind::Reply || found == awaited.end())
                continue;
            found->second->reply = Data(frame->payload);
            found->second->loop.quit();
        }
    }

    void end()
    {
        connection.reset();
        validity->end();
        for (const auto& [serial, each] : awaited)
            each->loop.quit();
    }

    std::unique_ptr<FrameConnection> connection;
    std::shared_ptr<Validity> validity;
    std::map<std::uint32_t, Awaited*> awaited;
    std::uint32_t lastSerial = 0;
};

class SocketRemotePort final : public RemotePort {
public:
    explicit SocketRemotePort(std::shared_ptr<Sender> sender) : _sender(std::move(sender)) {}
    ~SocketRemotePort() override
    {
        _sender->validity->valid = false; // without the handler: the port is being destroyed
        _sender->end();
    }

    bool isValid() const override { return _sender->validity->valid; }
    void invalidate() override { _sender->end(); }
    void setInvalidationHandler(std::function<void()> handler) override
    {
        _sender->validity->handler = std::move(handler);
    }

    Sent sendRequest(std::int32_t messageId, Bytes payload, milliseconds sendTimeout, milliseconds receiveTimeout,
                     Reply reply) override
    {
        // The port may be destroyed during the wait for the reply.
        const auto sender = _sender;
        if (!sender->connection)
            return {EPIPE, std::nullopt};
        if (payload.size() > kMaximumPayload)
            return {EMSGSIZE, std::nullopt};
        const bool awaits = reply == Reply::Awaited;
        const std::uint32_t serial = awaits ? ++sender->lastSerial : 0;
        const auto kind = awaits ? Frame::Kind::Request : Frame::Kind::Message;
        if (!sender->connection->send({kind, messageId, serial, payload}))
            return {EPIPE, std::nullopt};
        if (!sender->connection->waitUntilSent(sendTimeout)) {
            const bool gone = !sender->connection || !sender->connection->isOpen();
            // A frame that is partly sent cannot be withdrawn, so the connection is closed.
            sender->end();
            return {gone ? EPIPE : ETIMEDOUT, std::nullopt};
        }
        if (!awaits) {
            sender->read(); // an outer request's reply may have arrived during the send
            return {0, std::nullopt};
        }

        Sender::Awaited awaited;
        sender->awaited[serial] = &awaited;
        QTimer::singleShot(receiveTimeout, Qt::PreciseTimer, &awaited.loop, &QEventLoop::quit);
        sender->read(); // the reply may have arrived during the send
        if (!awaited.reply && sender->connection)
            awaited.loop.exec();
        sender->awaited.erase(serial);
        return {0, std::move(awaited.reply)};
    }

private:
    std::shared_ptr<Sender> _sender;
};

} // namespace

LinuxMessagePorts::LinuxMessagePorts(std::string directory, MainQueue& queue, SystemLog& log)
    : _directory(std::move(directory)), _queue(queue), _log(log)
{}

std::unique_ptr<LocalPort> LinuxMessagePorts::createLocal(std::string_view name, ReceiveHandler handler)
{
    const auto failed = [&](Problem problem) {
        _log.write(Priority::Error, "Port %s: %s", name, problem.text);
        _problem = std::move(problem);
        return nullptr;
    };
    if (!isPortName(name))
        return failed({"not a valid port name"});
    if (auto problem = secureRuntimeDirectory(_directory))
        return failed(*std::move(problem));
    removeStaleSockets(_directory, std::string(name) + ".");
    auto receiver = std::make_shared<Receiver>(std::move(handler), _log);
    receiver->listener.accepted = [raw = receiver.get()](auto connection) { raw->take(std::move(connection)); };
    const auto path = _directory + "/" + vox::addressOfPort(name, ::getpid());
    if (auto problem = receiver->listener.listen(path))
        return failed(*std::move(problem));
    _problem.reset();
    // Refers to the listening only: a closed receiver may still exist in a task.
    receiver->listening = std::make_shared<int>();
    _listening.insert_or_assign(std::string(name), receiver->listening);
    return std::make_unique<SocketLocalPort>(std::move(receiver), _queue);
}

bool LinuxMessagePorts::isListening(std::string_view name) const
{
    const auto found = _listening.find(name);
    return found != _listening.end() && !found->second.expired();
}

std::unique_ptr<RemotePort> LinuxMessagePorts::createRemote(std::string_view name)
{
    if (!isPortName(name))
        return nullptr;
    auto sender = std::make_shared<Sender>(_queue);
    sender->connection = FrameConnection::connectTo(_directory + "/" + std::string(name), kConnectTimeout, _log);
    if (!sender->connection)
        return nullptr;
    sender->connection->readable = [raw = sender.get()] { raw->read(); };
    sender->connection->closed = [raw = sender.get()] { raw->end(); };
    return std::make_unique<SocketRemotePort>(std::move(sender));
}

} // namespace kestrum
