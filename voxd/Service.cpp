#include "voxd/Service.h"

#include "platform/SystemLog.h"
#include "platform/linux/RuntimeDirectory.h"
#include "platform/linux/VoxProtocol.h"
#include "support/Format.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <utility>

#include <unistd.h>

namespace kestrum {
namespace {

using namespace std::chrono;

// How long messages go out before sockets have their turn.
constexpr milliseconds kBatch{10};
constexpr milliseconds kConnectTimeout{1000};
constexpr hours kLongestWait{1};
constexpr std::string_view kCommandPorts = "org.kestrum.vox.command.";
constexpr std::string_view kTechnologyChanged = "kVoxTechnologyChangedNotification";

} // namespace

Service::Service(Settings settings, Source& source, const PropertyLists& lists, SystemLog& log,
                 std::function<void(Bytes)> streamed)
    : _settings(std::move(settings)),
      _source(source),
      _log(log),
      _streamed(std::move(streamed)),
      _host{[this] { return std::string_view(_technology); }, [this] { pace(); },
            [this](ServiceChannel& channel) {
                const auto found = std::ranges::find(_channels, &channel, &std::unique_ptr<ServiceChannel>::get);
                if (found != _channels.end())
                    retire(found, std::next(found));
                pace();
            },
            lists, log},
      _listener(log),
      _technology(source.technology())
{
    _listener.accepted = [this](auto connection) { acceptConnection(std::move(connection)); };
    _due.setSingleShot(true);
    _due.setTimerType(Qt::PreciseTimer);
    QObject::connect(&_due, &QTimer::timeout, &_due, [this] { streamDue(); });
}

Service::~Service() = default;

std::string Service::start()
{
    if (auto wrong = secureRuntimeDirectory(_settings.directory); !wrong.empty())
        return wrong;
    if (auto wrong = _listener.listen(_settings.directory + "/" + std::string(vox::kServerPort)); !wrong.empty())
        return wrong;
    removeStaleSockets(_settings.directory, kCommandPorts);
    return {};
}

void Service::acceptConnection(std::unique_ptr<FrameConnection> connection)
{
    if (_connections.size() == kMaximumConnections) {
        _log.write(Priority::Error, "refused a server connection: %lu stand already", _connections.size());
        return;
    }
    const auto place = _connections.insert(_connections.end(), std::move(connection));
    auto& accepted = **place;
    accepted.closed = [this, place] { _connections.erase(place); };
    accepted.readable = [this, place, &accepted] { serve(accepted, place); };
}

void Service::serve(FrameConnection& connection, Connections::iterator place)
{
    // A malformed frame closes the connection within `next`; nothing of it is touched then.
    while (const auto frame = connection.next()) {
        if (frame->kind != Frame::Kind::Request)
            continue;
        const auto answer = frame->messageId == vox::kCreateLogChannel
                                ? createLogChannel(textOf(frame->payload))
                                : LogChannelAnswer{vox::kServiceErrors, vox::kBadRequest, std::nullopt};
        if (!connection.send({Frame::Kind::Reply, frame->messageId, frame->serial, vox::encode(answer)})) {
            _connections.erase(place);
            return;
        }
    }
}

LogChannelAnswer Service::createLogChannel(std::string_view address)
{
    const auto failed = [&](std::int32_t code, const char* why) {
        _log.write(Priority::Error, "refused a log channel to \"%s\": %s", address.substr(0, 200), why);
        return LogChannelAnswer{vox::kServiceErrors, code, std::nullopt};
    };
    if (!isPortName(address))
        return failed(vox::kBadRequest, "not an address");
    if (_channels.size() == kMaximumChannels)
        return failed(vox::kTooManyChannels, "too many channels");
    auto logPort = FrameConnection::connectTo(_settings.directory + "/" + std::string(address), kConnectTimeout, _log);
    if (!logPort)
        return failed(vox::kNoReceiver, "nobody listens there");
    const auto name = formatted("%s%d.%u", kCommandPorts, ::getpid(), ++_lastChannel);
    auto channel = std::make_unique<ServiceChannel>(_host, std::move(logPort));
    if (const auto wrong = channel->listen(_settings.directory + "/" + name); !wrong.empty())
        return failed(vox::kNoReceiver, wrong.c_str());
    _channels.push_back(std::move(channel));
    return {0, 0, name};
}

bool Service::isStreamed() const
{
    return std::ranges::any_of(_channels, [](const auto& each) { return each->isStreaming(); });
}

microseconds Service::position(Moment now) const
{
    if (!_since)
        return _position;
    const duration<double, std::micro> run = (now - *_since) * _settings.speed;
    // Held well inside the range, whatever the speed.
    return _position + microseconds(static_cast<std::int64_t>(std::min(run.count(), 1e18)));
}

// Starts, stops and aims the source's time.
void Service::pace()
{
    const Moment now = steady_clock::now();
    if (!isStreamed()) {
        _position = position(now);
        _since.reset();
        _due.stop();
        return;
    }
    if (!_since)
        _since = now;
    if (!_next)
        fetch();
    if (!_next)
        return;
    const duration<double, std::milli> wait = (_next->at - position(now)) / _settings.speed;
    const duration<double, std::milli> longest = kLongestWait;
    _due.start(milliseconds(static_cast<std::int64_t>(std::ceil(std::clamp(wait.count(), 0.0, longest.count())))));
}

void Service::fetch()
{
    if (_sourceEnded)
        return;
    _next = _source.next();
    _nextTechnology = _source.technology();
    _sourceEnded = !_next;
    if (_sourceEnded && sourceEnded)
        sourceEnded();
}

void Service::streamDue()
{
    for (const Moment end = steady_clock::now() + kBatch; _next;) {
        const Moment now = steady_clock::now();
        if (now >= end || _next->at > position(now))
            break;
        if (_nextTechnology != _technology) {
            changeTechnology();
            break;
        }
        const Data message(std::move(_next->bytes));
        if (_streamed)
            _streamed(message.bytes());
        for (const auto& channel : _channels)
            channel->stream(message);
        _next.reset();
        fetch();
    }
    pace();
}

// Clients ask for the technology once, when they connect: so they are made to connect again.
void Service::changeTechnology()
{
    _technology = _nextTechnology;
    _log.write(Priority::Notice, "the technology is now %s", _technology);
    for (const auto& connection : _connections)
        connection->send({Frame::Kind::Message, vox::kNotification, 0, bytesOf(kTechnologyChanged)});
    retire(_channels.begin(), _channels.end());
}

// Not at once: a channel is retired from within its own callbacks.
void Service::retire(Channels::iterator first, Channels::iterator last)
{
    _retired.splice(_retired.end(), _channels, first, last);
    QTimer::singleShot(0, &_due, [this] { _retired.clear(); });
}

} // namespace kestrum
