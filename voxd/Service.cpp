#include "voxd/Service.h"

#include "platform/SystemLog.h"
#include "platform/posix/RuntimeDirectory.h"
#include "platform/posix/VoxProtocol.h"
#include "support/Format.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <utility>

#include <unistd.h>

namespace kestrum {
namespace {

using namespace std::chrono;

// The maximum time for sending messages before the sockets are served again.
constexpr milliseconds kBatch{10};
// The messages of this much time are sent together, at most this late, so that the service and its clients wake up 20
// times a second at any rate of messages.
constexpr milliseconds kSlice{50};
constexpr milliseconds kConnectTimeout{1000};
constexpr hours kLongestWait{1};
constexpr std::string_view kCommandPorts = "org.kestrum.vox.command.";
constexpr std::string_view kTechnologyChanged = "kVoxTechnologyChangedNotification";

} // namespace

Service::Service(Settings settings, Source& source, PropertyLists& lists, SystemLog& log, Witness witness)
    : _settings(std::move(settings)),
      _source(source),
      _log(log),
      _witness(std::move(witness)),
      _host{[this] { return std::string_view(_technology); },
            [this] { pace(); },
            [this](ServiceChannel& channel) {
                const auto found = std::ranges::find(_channels, &channel, &std::unique_ptr<ServiceChannel>::get);
                if (found != _channels.end())
                    retire(found, std::next(found));
                pace();
            },
            _witness.dropped,
            _settings.send,
            lists,
            log},
      _listener(log),
      _technology(source.technology())
{
    _listener.accepted = [this](auto connection) { acceptConnection(std::move(connection)); };
    _due.setSingleShot(true);
    _due.setTimerType(Qt::PreciseTimer);
    QObject::connect(&_due, &QTimer::timeout, &_due, [this] { streamDue(); });
    _source.available = [this] { pace(); };
}

Service::~Service()
{
    _source.available = [] {};
}

std::optional<Problem> Service::start()
{
    if (auto problem = secureRuntimeDirectory(_settings.directory))
        return problem;
    if (auto problem = _listener.listen(_settings.directory + "/" + std::string(vox::kServerPort)))
        return problem;
    removeStaleSockets(_settings.directory, kCommandPorts);
    return {};
}

void Service::acceptConnection(std::unique_ptr<FrameConnection> connection)
{
    if (_clients.size() == kMaximumConnections) {
        _log.write(Priority::Error, "refused a server connection: there are already %lu", _clients.size());
        return;
    }
    const auto client = _clients.insert(_clients.end(), Client{std::move(connection), nullptr});
    client->connection->closed = [this, client] { _clients.erase(client); };
    client->connection->readable = client->connection->written = [this, client] { serve(client); };
}

void Service::serve(Clients::iterator client)
{
    // A malformed frame closes the connection inside `next`, and nothing else changes then. Requests of a client that
    // does not read its replies stay in that client's socket.
    while (!client->connecting && client->connection->unsent() < ServiceChannel::kUnsentReplies) {
        const auto frame = client->connection->next();
        if (!frame)
            return;
        if (frame->kind != Frame::Kind::Request)
            continue;
        if (frame->messageId == vox::kCreateLogChannel)
            createLogChannel(client, frame->serial, std::string(textOf(frame->payload)));
        else
            reply(client, frame->messageId, frame->serial, {vox::kServiceErrors, vox::kBadRequest, std::nullopt});
    }
}

// The connection's own handler removes a client whose connection has closed.
void Service::reply(Clients::iterator client, std::int32_t messageId, std::uint32_t serial,
                    const LogChannelAnswer& answer)
{
    _settings.send(*client->connection, {Frame::Kind::Reply, messageId, serial, vox::encode(answer)});
}

void Service::createLogChannel(Clients::iterator client, std::uint32_t serial, const std::string& address)
{
    const auto refused = [&](std::int32_t code, std::string_view why) {
        reply(client, vox::kCreateLogChannel, serial, refuse(address, code, why));
    };
    if (!isPortName(address))
        return refused(vox::kBadRequest, "not an address");
    if (_channels.size() >= kMaximumChannels)
        return refused(vox::kTooManyChannels, "too many channels");
    client->connecting = std::make_unique<FrameConnectionAttempt>(
        _settings.directory + "/" + address, kConnectTimeout, _log,
        [this, client, serial, address](std::unique_ptr<FrameConnection> logPort) {
            client->connecting.reset();
            reply(client, vox::kCreateLogChannel, serial, openChannel(address, std::move(logPort)));
            serve(client);
        });
}

LogChannelAnswer Service::openChannel(std::string_view address, std::unique_ptr<FrameConnection> logPort)
{
    if (!logPort)
        return refuse(address, vox::kNoReceiver, "no process listens there");
    if (_channels.size() >= kMaximumChannels) // other clients may have taken the last channels
        return refuse(address, vox::kTooManyChannels, "too many channels");
    const auto name = formatted("%s%d.%u", kCommandPorts, ::getpid(), ++_lastChannel);
    auto channel = std::make_unique<ServiceChannel>(_host, std::move(logPort));
    if (const auto problem = channel->listen(_settings.directory + "/" + name))
        return refuse(address, vox::kNoReceiver, problem->text);
    _channels.push_back(std::move(channel));
    _loggedRefusals.clear();
    return {0, 0, name};
}

// A refused display tries again every 5 s. One line per reason is enough until something changes.
LogChannelAnswer Service::refuse(std::string_view address, std::int32_t code, std::string_view why)
{
    if (_loggedRefusals.insert(code).second)
        _log.write(Priority::Error, "refused a log channel to \"%s\": %s", address.substr(0, 200), why);
    return {vox::kServiceErrors, code, std::nullopt};
}

void Service::countStreams()
{
    const auto streams = static_cast<std::size_t>(
        std::ranges::count_if(_channels, [](const auto& each) { return each->isStreaming(); }));
    if (std::exchange(_streams, streams) != streams)
        _source.streamedTo(streams);
}

microseconds Service::position(Moment now) const
{
    if (!_since)
        return _position;
    const duration<double, std::micro> run = (now - *_since) * _settings.speed;
    // Limited, so that no speed overflows the type.
    return _position + microseconds(static_cast<std::int64_t>(std::min(run.count(), 1e18)));
}

// Starts or stops the source's time, and sets the timer for the next message.
void Service::pace()
{
    const Moment now = steady_clock::now();
    countStreams();
    if (_streams == 0) {
        _position = position(now);
        _since.reset();
        _due.stop();
        if (_source.isLive())
            _next.reset();
        return;
    }
    if (!_since)
        _since = now;
    if (!_next)
        fetch();
    if (!_next)
        return;
    const duration<double, std::milli> untilDue = (_next->at - position(now)) / _settings.speed;
    const auto wait = std::max<duration<double, std::milli>>(untilDue, _nextSlice - now);
    const duration<double, std::milli> longest = kLongestWait;
    _due.start(milliseconds(static_cast<std::int64_t>(std::ceil(std::clamp(wait.count(), 0.0, longest.count())))));
}

void Service::fetch()
{
    if (_sourceEnded)
        return;
    _next = _source.next();
    _nextTechnology = _source.technology();
    _sourceEnded = !_next && !_source.isLive();
    if (_sourceEnded && sourceEnded)
        sourceEnded();
}

void Service::streamDue()
{
    const Moment begin = steady_clock::now();
    // Shorter in a fast replay, so that the clients do not get its messages in large bursts.
    const duration<double, std::milli> slice = kSlice / std::max(_settings.speed, 1.0);
    _nextSlice = begin + round<Moment::duration>(slice);
    while (_next) {
        const Moment now = steady_clock::now();
        if (_next->at > position(now))
            break;
        if (now >= begin + kBatch) {
            _nextSlice = now; // more is due already
            break;
        }
        if (_nextTechnology != _technology) {
            changeTechnology();
            break;
        }
        if (_settings.accompany)
            if (auto companion = _settings.accompany(*_next))
                stream(std::move(*companion));
        stream(std::move(_next->bytes));
        _next.reset();
        fetch();
    }
    pace();
}

void Service::stream(std::vector<std::byte> message)
{
    const Data shared(std::move(message));
    _witness.streamed(shared.bytes());
    for (const auto& channel : _channels)
        channel->stream(shared);
}

// Clients ask for the technology once, when they connect. They have to reconnect to learn the new one.
void Service::changeTechnology()
{
    _technology = _nextTechnology;
    _log.write(Priority::Notice, "the technology is now %s", _technology);
    for (const auto& client : _clients)
        if (client.connection->unsent() <
            ServiceChannel::kUnsentReplies) // a client that does not read gets nothing more
            _settings.send(*client.connection,
                           {Frame::Kind::Message, vox::kNotification, 0, bytesOf(kTechnologyChanged)});
    retire(_channels.begin(), _channels.end());
}

// Later, not now: this may run inside the channel's own callbacks.
void Service::retire(Channels::iterator first, Channels::iterator last)
{
    _retired.splice(_retired.end(), _channels, first, last);
    _loggedRefusals.clear();
    QTimer::singleShot(0, &_due, [this] { _retired.clear(); });
}

} // namespace kestrum
