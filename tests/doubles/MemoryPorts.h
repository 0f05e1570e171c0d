#pragma once

#include "doubles/CrankedQueue.h"
#include "platform/MessagePorts.h"
#include "platform/TelephonyService.h"

#include <algorithm>
#include <cerrno>
#include <map>
#include <utility>
#include <vector>

namespace kestrum {

/// Message ports within one process, on a hand-cranked queue. The test is the other process: it answers the remote
/// ports, and sends to the local ones.
class MemoryPorts final : public MessagePorts {
public:
    using Duration = std::chrono::milliseconds;

    explicit MemoryPorts(CrankedQueue& queue) : _queue(queue) {}

    struct Request {
        std::string port;
        std::int32_t messageId;
        Data payload;
        Duration sendTimeout, receiveTimeout;
        RemotePort::Reply reply;

        std::string text() const { return std::string(textOf(payload.bytes())); }
    };
    struct Answer {
        std::int32_t status = 0;
        std::optional<Data> reply = std::nullopt; ///< empty: the other process sends no reply
        Duration after{0};                        ///< the delay of the reply
    };
    using Server = std::function<Answer(const Request&)>;

    /// Adds a listener with that name.
    void serve(const std::string& name, Server server) { _servers[name] = std::move(server); }

    /// Removes the listener with that name. The connections to it become invalid.
    void kill(const std::string& name)
    {
        _servers.erase(name);
        for (const auto& each : std::exchange(_remotes, {}))
            if (const auto end = each.second.lock(); end && each.first == name)
                end->invalidate();
    }

    /// Sends a message from another process to the local port of that name. Returns whether a port takes it.
    bool send(std::string_view name, std::int32_t messageId, std::string_view payload)
    {
        const auto port = local(name);
        if (!port)
            return false;
        port->messages.push_back({messageId, Data(bytesOf(payload))});
        port->deliver();
        return true;
    }

    /// The local port of that name becomes invalid by itself.
    void invalidateLocal(std::string_view name)
    {
        if (const auto port = local(name))
            port->invalidate();
    }
    bool hasLocal(std::string_view name) const { return local(name) != nullptr; }

    std::unique_ptr<LocalPort> createLocal(std::string_view name, ReceiveHandler handler) override
    {
        if (!createsLocal || hasLocal(name))
            return nullptr;
        auto end = std::make_shared<LocalEnd>(_queue);
        end->handler = std::move(handler);
        _locals.insert_or_assign(std::string(name), end);
        return std::make_unique<Local>(std::move(end));
    }

    std::unique_ptr<RemotePort> createRemote(std::string_view name) override
    {
        const auto server = _servers.find(std::string(name));
        if (server == _servers.end())
            return nullptr;
        auto end = std::make_shared<End>(_queue);
        _remotes.emplace_back(name, end);
        return std::make_unique<Remote>(std::move(end), *this, server->first, server->second);
    }

    bool createsLocal = true;
    /// All messages to remote ports, including closed ones.
    std::vector<Request> requests;

private:
    /// The state that a port shares with its tasks: it may outlive the port while a handler runs.
    struct End : std::enable_shared_from_this<End> {
        explicit End(CrankedQueue& of) : queue(of) {}

        void invalidate()
        {
            if (!std::exchange(valid, false))
                return;
            queue.post([end = weak_from_this()] {
                if (const auto self = end.lock(); self && self->invalidated)
                    std::exchange(self->invalidated, nullptr)();
            });
        }

        CrankedQueue& queue;
        bool valid = true;
        std::function<void()> invalidated;
    };
    struct LocalEnd : End {
        using End::End;

        struct Message {
            std::int32_t id;
            Data payload;
        };

        /// Passes on the messages that wait for the delivery queue.
        void deliver()
        {
            if (deliveryQueue == nullptr)
                return;
            for (auto& message : std::exchange(messages, {}))
                deliveryQueue->post([receiver = weak_from_this(), message = std::move(message)] {
                    // Messages on their way are lost when the port closes. Their handler may close the port.
                    if (const auto end = std::static_pointer_cast<LocalEnd>(receiver.lock()); end && end->valid)
                        end->handler(message.id, message.payload.bytes());
                });
        }

        ReceiveHandler handler;
        MainQueue* deliveryQueue = nullptr;
        std::vector<Message> messages;
    };

    template <typename Role, typename EndType>
    class PortOn : public Role {
    public:
        explicit PortOn(std::shared_ptr<EndType> end) : _end(std::move(end)) {}
        ~PortOn() override
        {
            _end->invalidated = nullptr;
            _end->valid = false;
        }
        bool isValid() const override { return _end->valid; }
        void invalidate() override { _end->invalidate(); }
        void setInvalidationHandler(std::function<void()> handler) override { _end->invalidated = std::move(handler); }

    protected:
        std::shared_ptr<EndType> _end;
    };

    class Local final : public PortOn<LocalPort, LocalEnd> {
    public:
        using PortOn::PortOn;
        void setDeliveryQueue(MainQueue& queue) override
        {
            _end->deliveryQueue = &queue;
            _end->deliver();
        }
    };

    class Remote final : public PortOn<RemotePort, End> {
    public:
        Remote(std::shared_ptr<End> end, MemoryPorts& ports, std::string name, Server server)
            : PortOn(std::move(end)), _ports(ports), _name(std::move(name)), _server(std::move(server))
        {}

        Sent sendRequest(std::int32_t messageId, Bytes payload, Duration sendTimeout, Duration receiveTimeout,
                         Reply reply) override
        {
            const auto end = _end; // Tasks that run during the wait may destroy this port.
            const Request request{_name, messageId, Data(payload), sendTimeout, receiveTimeout, reply};
            _ports.requests.push_back(request);
            if (!end->valid)
                return {EPIPE, std::nullopt};
            const auto server = _server;
            const Answer answer = server(request);
            if (answer.status != 0 || reply == Reply::None)
                return {answer.status, std::nullopt};
            const bool inTime = answer.reply && answer.after <= receiveTimeout;
            const bool ended = end->queue.turn(inTime ? answer.after : receiveTimeout, [&] { return !end->valid; });
            return {0, inTime && !ended ? answer.reply : std::nullopt};
        }

    private:
        MemoryPorts& _ports;
        std::string _name;
        Server _server;
    };

    /// The open local port of that name.
    std::shared_ptr<LocalEnd> local(std::string_view name) const
    {
        const auto found = _locals.find(name);
        const auto port = found == _locals.end() ? nullptr : found->second.lock();
        return port && port->valid ? port : nullptr;
    }

    CrankedQueue& _queue;
    std::map<std::string, Server> _servers;
    std::map<std::string, std::weak_ptr<LocalEnd>, std::less<>> _locals;
    std::vector<std::pair<std::string, std::weak_ptr<End>>> _remotes;
};

/// A telephony service whose answers the test sets.
class MemoryTelephony final : public TelephonyService {
public:
    using Duration = std::chrono::milliseconds;
    static constexpr Duration kPatience{1000};
    static constexpr std::int32_t kSystemErrors = 2; ///< the domain of errno values

    /// Creates log channels to the local ports of `ports`.
    MemoryTelephony(CrankedQueue& queue, const MemoryPorts& ports) : _queue(queue), _ports(ports) {}

    std::unique_ptr<VoxServerConnection> connect(NotificationHandler handler) override
    {
        if (!reachable)
            return nullptr;
        auto end = std::make_shared<End>();
        end->handler = std::move(handler);
        std::erase_if(_ends, [](const auto& each) { return each.expired(); });
        _ends.push_back(end);
        return std::make_unique<Connection>(*this, std::move(end));
    }

    std::optional<Problem> problem() const override { return why.empty() ? std::nullopt : std::optional(Problem{why}); }

    /// Notifies all connected clients.
    void notify(const std::string& name)
    {
        for (const auto& each : _ends)
            if (const auto end = each.lock(); end && std::ranges::find(end->names, name) == end->names.end()) {
                end->names.push_back(name);
                if (end->names.size() == 1)
                    handOverLater(end);
            }
    }
    int openConnections() const
    {
        return static_cast<int>(std::ranges::count_if(_ends, [](const auto& each) { return !each.expired(); }));
    }

    bool reachable = true;
    std::string why; ///< the reason for refusing a channel
    LogChannelAnswer answer{0, 0, "vox.commands"};
    Duration answersAfter{0};            ///< more than `kPatience`: the answer is too late
    std::function<void()> whileCreating; ///< runs when a log channel is requested

    std::vector<std::string> channelsAsked;

private:
    /// The state that a connection shares with its tasks.
    struct End {
        NotificationHandler handler;
        std::vector<std::string> names; ///< of queued notifications
        bool held = false, closed = false;
    };

    class Connection final : public VoxServerConnection {
    public:
        Connection(MemoryTelephony& service, std::shared_ptr<End> end) : _service(service), _end(std::move(end)) {}
        ~Connection() override { _end->closed = true; }

        LogChannelAnswer networkMonitorCreateLogChannel(std::string_view serviceName) override
        {
            // Tasks that run during the wait may end this connection.
            return _service.create(serviceName, _end);
        }

    private:
        MemoryTelephony& _service;
        std::shared_ptr<End> _end;
    };

    LogChannelAnswer create(std::string_view serviceName, const std::shared_ptr<End> end)
    {
        channelsAsked.emplace_back(serviceName);
        if (!_ports.hasLocal(serviceName))
            return {kSystemErrors, ENOTCONN, std::nullopt};
        if (const auto run = whileCreating) // a copy, because the call may replace it
            run();
        const bool inTime = answersAfter <= kPatience;
        end->held = true;
        _queue.turn(inTime ? answersAfter : kPatience, [&] { return end->closed; });
        end->held = false;
        if (!end->names.empty())
            handOverLater(end);
        if (end->closed)
            return {kSystemErrors, EPIPE, std::nullopt};
        return inTime ? answer : LogChannelAnswer{kSystemErrors, ETIMEDOUT, std::nullopt};
    }

    void handOverLater(const std::weak_ptr<End>& waiting)
    {
        _queue.post([waiting] {
            const auto end = waiting.lock();
            if (!end || end->held)
                return;
            for (const auto& name : std::exchange(end->names, {}))
                if (!end->closed && end->handler)
                    end->handler(name);
        });
    }

    CrankedQueue& _queue;
    const MemoryPorts& _ports;
    std::vector<std::weak_ptr<End>> _ends;
};

} // namespace kestrum
