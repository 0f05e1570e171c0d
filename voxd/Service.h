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

namespace kestrum {

class SystemLog;

/// The telephony service: answers server connections, makes log channels, and streams one source to all of them. The
/// source's time runs while a client streams, and stands otherwise: nothing of it is lost between two clients.
class Service {
public:
    struct Settings {
        std::string directory;
        double speed = 1; ///< source time per real time, above 0
        /// Every frame goes out through it.
        FrameSender send = [](FrameConnection& connection, const Frame& frame) { return connection.send(frame); };
    };
    static constexpr std::size_t kMaximumChannels = 16, kMaximumConnections = 64;

    /// Receives everything that goes out, in order: for a recording.
    struct Witness {
        std::function<void(Bytes)> streamed = [](Bytes) {};                ///< each message, for whichever client
        std::function<void(std::uint64_t)> dropped = [](std::uint64_t) {}; ///< this many messages, for one client
    };

    /// All outlive the service.
    Service(Settings settings, Source& source, PropertyLists& lists, SystemLog& log, Witness witness);
    ~Service();

    std::optional<Problem> start();

    /// Runs once when the source has ended and its last message has gone out.
    std::function<void()> sourceEnded;

private:
    using Moment = std::chrono::steady_clock::time_point;
    // A server connection. It is served one request at a time, so that one client's slow port stops only itself.
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

    bool isStreamed() const;
    void pace();
    void fetch();
    void streamDue();
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
    std::set<std::int32_t> _loggedRefusals; ///< since the last channel was opened or closed
    unsigned _lastChannel = 0;

    std::string _technology;              // of the message streamed last
    std::optional<Source::Message> _next; // not due yet
    std::string _nextTechnology;
    std::chrono::microseconds _position{0}; // the source's time, when it stands
    std::optional<Moment> _since;           // when it began to run from there
    bool _sourceEnded = false;
    QTimer _due;
};

} // namespace kestrum
