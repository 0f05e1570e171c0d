#pragma once

#include <chrono>
#include <cstddef>
#include <optional>
#include <string_view>
#include <vector>

namespace kestrum {

/// Where the service's log comes from: a simulated drive, a capture, a modem. The service reads it at the pace of
/// the messages' times, while at least one client streams; all clients see the same log.
class Source {
public:
    virtual ~Source() = default;

    struct Message {
        std::chrono::microseconds at{0}; ///< since the source's start; never less than the message before
        std::vector<std::byte> bytes;    ///< one channel message, as it travels
    };

    /// The next message; nothing at the end, and ever after.
    virtual std::optional<Message> next() = 0;

    /// The identifier (kVoxLogChannelTechnology_...) of the message that `next` gave last; before the first, that of
    /// the first. When it changes, the service closes its channels, so that the clients ask again, and sends the
    /// message to those that reconnect.
    virtual std::string_view technology() const = 0;
};

} // namespace kestrum
