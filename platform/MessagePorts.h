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

/// What local and remote ports share.
class Port {
public:
    virtual ~Port() = default;

    /// False once the port is no longer usable: invalidated, or (remote) its owner has gone away.
    virtual bool isValid() const = 0;

    /// Makes the port unusable. Its invalidation handler runs later, from the main queue.
    virtual void invalidate() = 0;

    /// `handler` runs once when the port becomes invalid; an empty one removes it, and cancels a run that is
    /// still pending. The handler may destroy the port.
    virtual void setInvalidationHandler(std::function<void()> handler) = 0;
};

/// A named port on which other processes can send to this one.
class LocalPort : public Port {
public:
    /// Messages are handed over on `queue`, in the order in which each sender sent them.
    virtual void setDeliveryQueue(MainQueue& queue) = 0;
};

/// A connection to a named port of another process.
class RemotePort : public Port {
public:
    enum class Reply { None, Awaited };

    struct Sent {
        std::int32_t status;       ///< 0 = success
        std::optional<Data> reply; ///< only when awaited and received in time
    };

    /// Delivers a message, waiting up to `sendTimeout` for room. With `Reply::Awaited` it then waits up to
    /// `receiveTimeout`, serving timers and other messages meanwhile. An invalid port gives a non-zero status.
    virtual Sent sendRequest(std::int32_t messageId, Bytes payload, std::chrono::milliseconds sendTimeout,
                             std::chrono::milliseconds receiveTimeout, Reply reply) = 0;
};

/// Makes ports.
class MessagePorts {
public:
    virtual ~MessagePorts() = default;

    /// The payload is borrowed for the call. No reply is sent back. May destroy the port.
    using ReceiveHandler = std::function<void(std::int32_t messageId, Bytes payload)>;

    /// Null when the port cannot be made.
    virtual std::unique_ptr<LocalPort> createLocal(std::string_view name, ReceiveHandler handler) = 0;

    /// Null when nobody listens under that name.
    virtual std::unique_ptr<RemotePort> createRemote(std::string_view name) = 0;
};

} // namespace kestrum
