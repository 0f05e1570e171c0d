#pragma once

#include <chrono>
#include <cstddef>
#include <functional>
#include <optional>
#include <string_view>
#include <vector>

namespace kestrum {

/// The origin of the service's log: a simulated drive, a capture, a modem. The service reads it at the pace of the
/// messages' times while at least one client streams. All clients get the same log.
///
/// A source is made of messages that exist already, or it is live. A live source waits for its messages, and they are
/// of the moment: one that was not sent before the last client left is dropped.
class Source {
public:
    virtual ~Source() = default;

    struct Message {
        std::chrono::microseconds at{0}; ///< since the source's start; never before the previous message
        std::vector<std::byte> bytes;    ///< one channel message in its wire format
    };

    /// The next message. Empty at the end, and in every later call; of a live source: empty until `available`.
    virtual std::optional<Message> next() = 0;

    /// A live source has no end. Its messages are due at once.
    virtual bool isLive() const { return false; }

    /// A live source calls this when `next` has a message again; never within a call from the service.
    std::function<void()> available = [] {};

    /// The number of clients that stream has changed. A live source has a message at once when it has grown.
    virtual void streamedTo(std::size_t /*clients*/) {}

    /// The identifier (kVoxLogChannelTechnology_...) of the last message that `next` gave; before the first, that of
    /// the first. When it changes, the service closes its channels, so that the clients ask again. It sends the
    /// message to the clients that reconnect.
    virtual std::string_view technology() const = 0;
};

} // namespace kestrum
