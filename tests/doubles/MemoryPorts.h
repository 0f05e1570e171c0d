#pragma once

#include "doubles/CrankedQueue.h"
#include "platform/MessagePorts.h"
#include "platform/TelephonyService.h"

#include <algorithm>
#include <map>
#include <utility>
#include <vector>

namespace kestrum {

/// Message ports within one process, over a hand-cranked queue. The test plays the other process: it serves the
/// remote ports, and sends to the local ones.
class MemoryPorts final : public MessagePorts {
public:
    using Duration = std::chrono::milliseconds;

    /// The status of a message to a port that is closed.
    static constexpr std::int32_t kInvalid = -3;

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
        std::optional<Data> reply = std::nullopt; ///< none: the other side stays silent
        Duration after{0};                        ///< how long the reply is waited for
    };
    using Server = std::function<Answer(const Request&)>;

    /// From now on somebody listens under that name.
    void serve(const std::string& name, Server server) { _servers[name] = std::move(server); }

    /// The process that listens there goes away: the connections to it become invalid.
    void kill(const std::string& name)
    {
        _servers.erase(name);
        for (const auto& each : std::exchange(_remotes, {}))
            if (const auto end = each.second.lock(); end && each.first == name)
                end->invalidate();
    }

    /// A message from another process to the local port of that name. Whether there is one that takes it.
    bool send(const std::string& name, std::int32_t messageId, std::string_view payload)
    {
        const auto port = _locals[name].lock();
        if (!port || !port->valid || port->deliveryQueue == nullptr)
            return false;
        port->deliveryQueue->post([receiver = std::weak_ptr(port), messageId, data = Data(bytesOf(payload))] {
            // Whatever is still under way when the port closes is lost. Its handler may close it.
            if (const auto end = receiver.lock(); end && end->valid)
                end->handler(messageId, data.bytes());
        });
        return true;
    }

    /// The local port of that name becomes invalid by itself.
    void invalidateLocal(const std::string& name)
    {
        if (const auto port = _locals[name].lock())
            port->invalidate();
    }
    bool hasLocal(const std::string& name) { return !_locals[name].expired(); }

    std::unique_ptr<LocalPort> createLocal(std::string_view name, ReceiveHandler handler) override
    {
        if (!createsLocal)
            return nullptr;
        auto end = std::make_shared<LocalEnd>(_queue);
        end->handler = std::move(handler);
        _locals[std::string(name)] = end;
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
    /// Every message to a remote port, those to closed ones too.
    std::vector<Request> requests;

private:
    /// What a port shares with the world: it may outlast the port while something runs in it.
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
        ReceiveHandler handler;
        MainQueue* deliveryQueue = nullptr;
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
        void setDeliveryQueue(MainQueue& queue) override { _end->deliveryQueue = &queue; }
    };

    class Remote final : public PortOn<RemotePort, End> {
    public:
        Remote(std::shared_ptr<End> end, MemoryPorts& ports, std::string name, Server server)
            : PortOn(std::move(end)), _ports(ports), _name(std::move(name)), _server(std::move(server))
        {}

        Sent sendRequest(std::int32_t messageId, Bytes payload, Duration sendTimeout, Duration receiveTimeout,
                         Reply reply) override
        {
            const auto end = _end; // What the wait serves may destroy this port.
            const Request request{_name, messageId, Data(payload), sendTimeout, receiveTimeout, reply};
            _ports.requests.push_back(request);
            if (!end->valid)
                return {kInvalid, std::nullopt};
            const auto server = _server;
            const Answer answer = server(request);
            if (answer.status != 0 || reply == Reply::None)
                return {answer.status, std::nullopt};
            const bool inTime = answer.reply && answer.after <= receiveTimeout;
            end->queue.turn(inTime ? answer.after : receiveTimeout, [&] { return !end->valid; });
            if (!end->valid)
                return {kInvalid, std::nullopt};
            return {0, inTime ? answer.reply : std::nullopt};
        }

    private:
        MemoryPorts& _ports;
        std::string _name;
        Server _server;
    };

    CrankedQueue& _queue;
    std::map<std::string, Server> _servers;
    std::map<std::string, std::weak_ptr<LocalEnd>> _locals;
    std::vector<std::pair<std::string, std::weak_ptr<End>>> _remotes;
};

/// A telephony service that answers as the test says.
class MemoryTelephony final : public TelephonyService {
public:
    std::unique_ptr<VoxServerConnection> connect(NotificationHandler handler) override
    {
        return reachable ? std::make_unique<Connection>(*this, std::move(handler)) : nullptr;
    }

    std::string problem() const override { return why; }

    bool reachable = true;
    std::string why; ///< there is no channel
    LogChannelAnswer answer{0, 0, "vox.commands"};
    /// Runs while a log channel is being created, with the connection's notification handler.
    std::function<void(const NotificationHandler&)> whileCreating;

    std::vector<std::string> channelsAsked;
    int openConnections = 0;

private:
    class Connection final : public VoxServerConnection {
    public:
        Connection(MemoryTelephony& service, NotificationHandler handler)
            : _service(service), _handler(std::move(handler))
        {
            ++_service.openConnections;
        }
        ~Connection() override { --_service.openConnections; }

        LogChannelAnswer networkMonitorCreateLogChannel(std::string_view serviceName) override
        {
            _service.channelsAsked.emplace_back(serviceName);
            if (_service.whileCreating)
                _service.whileCreating(_handler);
            return _service.answer;
        }

    private:
        MemoryTelephony& _service;
        NotificationHandler _handler;
    };
};

} // namespace kestrum
