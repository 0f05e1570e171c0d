#pragma once

#include "platform/PropertyLists.h"
#include "platform/TelephonyService.h"
#include "platform/qt/FrameSocket.h"
#include "voxd/ServiceChannel.h"
#include "voxd/Source.h"

#include <QTimer>

#include <chrono>
#include <functional>
#include <list>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <vector>

namespace kestrum {

class SystemLog;

/// The telephony service: answers server connections, creates log channels, and streams one source to all of them.
/// The source's time runs only while a client streams, so no message is lost between two clients.
class Service {
public:
    struct Settings {
        std::string directory;
        double speed = 1; ///< source time per real time, above 0
        /// Sends every frame.
        FrameSender send = [](FrameConnection& connection, const Frame& frame) { return connection.send(frame); };
        /// Gets each message when it is due. May change it, and may give a message that is sent before it.
        std::function<std::optional<std::vector<std::byte>>(Source::Message& due)> accompany = {};
    };
    static constexpr std::size_t kMaximumChannels = 16, kMaximumConnections = 64;

    /// Gets everything that is sent, in order, for a recording.
    struct Witness {
        std::function<void(Bytes)> streamed = [](Bytes) {};                ///< each message, once for all clients
        std::function<void(std::uint64_t)> dropped = [](std::uint64_t) {}; ///< this many messages, for one client
    };

    /// All arguments must outlive the service.
    Service(Settings settings, Source& source, PropertyLists& lists, SystemLog& log, Witness witness);
    ~Service();

    std::optional<Problem> start();

    /// Called once, after the source has ended and its last message was sent.
    std::function<void()> sourceEnded;

private:
    using Moment = std::chrono::steady_clock::time_point;
    // A server connection. Its requests are served one at a time, so a slow port delays only its own client.
    struct Client {
        std::unique_ptr<FrameConnection> connection;
        std::unique_ptr<FrameConnectionAttempt> connecting; ///< to the port that the current request names
    };
    using Clients = std::list<Client>;
    using Channels = std::list<std::unique_ptr<ServiceChannel>>;

    void acceptConnection(std::unique_ptr<FrameConnection> connection);
    void serve(Clients::iterator client);
    void reply(Clients::iterator client, std::int32_t messageId, std::uint32_t serial, const LogChannelAnswer& answer);
    void createLogChannel(Clients::iterator client, std::uint32_t serial, const std::string& address);
    LogChannelAnswer openChannel(std::string_view address, std::unique_ptr<FrameConnection> logPort);
    LogChannelAnswer refuse(std::string_view address, std::int32_t code, std::string_view why);

    void countStreams();
    void pace();
    void fetch();
    void streamDue();
    void stream(std::vector<std::byte> message);
    void changeTechnology();
    void retire(Channels::iterator first, Channels::iterator last);
    std::chrono::microseconds position(Moment now) const;

    Settings _settings;
    Source& _source;
    SystemLog& _log;
    Witness _witness;
    ServiceChannel::Host _host;
    FrameListener _listener;
    Clients _clients;
    Channels _channels, _retired;
    std::set<std::int32_t> _loggedRefusals; ///< since a channel was last opened or closed
    unsigned _lastChannel = 0;

    std::string _technology;              // of the last message streamed
    std::optional<Source::Message> _next; // waits for its time
    std::string _nextTechnology;
    std::chrono::microseconds _position{0}; // the source's time at `_since`, or while it stands still
    std::optional<Moment> _since;           // when the source's time started to run; empty while it stands still
    std::size_t _streams = 0;               ///< clients that stream
    bool _sourceEnded = false;
    Moment _nextSlice; // no message is sent before it
    QTimer _due;
};

} // namespace kestrum
