#pragma once

#include "support/Bytes.h"

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace kestrum {

class MainQueue;

/// What local and remote ports have in common.
class Port {
public:
    virtual ~Port() = default;

    /// False when the port is no longer usable: it was invalidated, or the process of a remote port has ended.
    virtual bool isValid() const = 0;

    /// Makes the port unusable. Its invalidation handler runs later, from the main queue.
    virtual void invalidate() = 0;

    /// `handler` runs once when the port becomes invalid. An empty handler removes the earlier one and cancels its
    /// pending run. The handler may destroy the port.
    virtual void setInvalidationHandler(std::function<void()> handler) = 0;
};

/// A named port on which this process receives messages.
class LocalPort : public Port {
public:
    /// Messages are delivered on `queue`, those of one sender in the order in which it sent them.
    virtual void setDeliveryQueue(MainQueue& queue) = 0;
};

/// A connection to a named port of another process.
class RemotePort : public Port {
public:
    enum class Reply { None, Awaited };

    struct Sent {
        std::int32_t status;       ///< 0 = success
        std::optional<Data> reply; ///< present when awaited and received in time
    };

    /// Sends a message; waits up to `sendTimeout` for room. With `Reply::Awaited` it then waits up to `receiveTimeout`
    /// for the reply; timers and other messages are served meanwhile. An invalid port gives a non-zero status.
    virtual Sent sendRequest(std::int32_t messageId, Bytes payload, std::chrono::milliseconds sendTimeout,
                             std::chrono::milliseconds receiveTimeout, Reply reply) = 0;
};

/// Makes ports.
class MessagePorts {
public:
    virtual ~MessagePorts() = default;

    /// Receives a message. The payload is valid during the call. The handler may destroy the port. No reply is sent.
    using ReceiveHandler = std::function<void(std::int32_t messageId, Bytes payload)>;

    /// Null when the port cannot be created.
    virtual std::unique_ptr<LocalPort> createLocal(std::string_view name, ReceiveHandler handler) = 0;

    /// Null when no process listens under that name.
    virtual std::unique_ptr<RemotePort> createRemote(std::string_view name) = 0;
};

} // namespace kestrum
