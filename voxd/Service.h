#pragma once

#include "platform/PropertyLists.h"
#include "platform/TelephonyService.h"
#include "platform/linux/FrameSocket.h"
#include "voxd/ServiceChannel.h"
#include "voxd/Source.h"

#include <QTimer>

#include <chrono>
#include <functional>
#include <list>
#include <memory>
#include <optional>
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
    };
    static constexpr std::size_t kMaximumChannels = 16, kMaximumConnections = 64;

    /// All outlive the service. `streamed` is given each message as it goes out, whoever wants it.
    Service(Settings settings, Source& source, const PropertyLists& lists, SystemLog& log,
            std::function<void(Bytes)> streamed = {});
    ~Service();

    /// Empty on success, else what is wrong.
    std::string start();

    /// Runs once when the source has ended and its last message has gone out.
    std::function<void()> sourceEnded;

private:
    using Moment = std::chrono::steady_clock::time_point;
    using Connections = std::list<std::unique_ptr<FrameConnection>>;
    using Channels = std::list<std::unique_ptr<ServiceChannel>>;

    void acceptConnection(std::unique_ptr<FrameConnection> connection);
    void serve(FrameConnection& connection, Connections::iterator place);
    LogChannelAnswer createLogChannel(std::string_view address);

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
    std::function<void(Bytes)> _streamed;
    ServiceChannel::Host _host;
    FrameListener _listener;
    Connections _connections;
    Channels _channels, _retired;
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
