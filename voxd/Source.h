#pragma once

#include <chrono>
#include <cstddef>
#include <optional>
#include <string_view>
#include <vector>

namespace kestrum {

/// The origin of the service's log: a simulated drive, a capture, a modem. The service reads it at the pace of the
/// messages' times while at least one client streams. All clients get the same log.
class Source {
public:
    virtual ~Source() = default;

    struct Message {
        std::chrono::microseconds at{0}; ///< since the source's start; never before the previous message
        std::vector<std::byte> bytes;    ///< one channel message in its wire format
    };

    /// The next message; empty at the end, and in every later call.
    virtual std::optional<Message> next() = 0;

    /// The identifier (kVoxLogChannelTechnology_...) of the last message that `next` gave; before the first, that of
    /// the first. When it changes, the service closes its channels, so that the clients ask again. It sends the
    /// message to the clients that reconnect.
    virtual std::string_view technology() const = 0;
};

} // namespace kestrum
