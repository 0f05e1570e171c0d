#pragma once

#include "platform/PropertyLists.h"
#include "platform/qt/FrameSocket.h"
#include "voxd/Outbox.h"
#include "voxd/Subscription.h"

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include <QTimer>

namespace kestrum {

class SystemLog;

/// Sends a frame, as `FrameConnection::send` does.
using FrameSender = std::function<bool(FrameConnection&, const Frame&)>;

/// One client's log channel. It takes commands at a separate port and sends the log to the client's port. It ends
/// when either connection closes.
class ServiceChannel {
public:
    /// The services that the channel uses.
    struct Host {
        std::function<std::string_view()> technology;
        std::function<void()> streamingChanged;
        std::function<void(ServiceChannel&)> ended; ///< at most once; must not destroy the channel at once
        std::function<void(std::uint64_t)> dropped; ///< this many messages, when the client does not read
        FrameSender send;
        PropertyLists& lists;
        SystemLog& log;
    };

    /// The maximum number of bytes that wait for a client that does not read.
    static constexpr std::size_t kHeldBytes = 8 << 20;
    /// A connection with more bytes of replies than this is not read until its client has read.
    static constexpr std::size_t kUnsentReplies = 256 << 10;
    /// A client that has not connected to the command port within this time counts as gone.
    static constexpr std::chrono::seconds kCommandTimeout{10};

    /// `logPort` is connected to the client's receiving port. `host` must outlive the channel.
    ServiceChannel(const Host& host, std::unique_ptr<FrameConnection> logPort);
    ~ServiceChannel();

    /// Listens for the client's commands.
    std::optional<Problem> listen(const std::string& path);

    bool isStreaming() const { return _subscription.has_value(); }
    /// Sends the message if the client has subscribed to it, or stores it until the client reads.
    void stream(const Data& message);

private:
    void accept(std::unique_ptr<FrameConnection> connection);
    void readCommands();
    void readLogPort();
    void obey(const Frame& frame);
    void flush();
    void sendLosses();
    void end();

    const Host& _host;
    std::string _name;
    std::unique_ptr<FrameConnection> _logPort, _commands;
    FrameListener _listener;
    QTimer _commandTimeout;
    std::optional<Subscription> _subscription; // empty: not streaming
    Outbox _outbox;
    std::size_t _reportedDrops = 0; ///< as reported in the system's log
    std::size_t _sentDrops = 0;     ///< as reported to the client
    bool _dropping = false;
    bool _ended = false;
};

} // namespace kestrum
