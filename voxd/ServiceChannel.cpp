#include "voxd/ServiceChannel.h"

#include "platform/SystemLog.h"
#include "platform/posix/VoxProtocol.h"
#include "support/FieldWriter.h"
#include "support/Format.h"

#include <array>
#include <filesystem>
#include <utility>

namespace kestrum {
namespace {

// The socket's buffer. Further messages wait in the outbox, which can still drop whole messages.
constexpr std::size_t kSocketBytes = 256 << 10;

} // namespace

ServiceChannel::ServiceChannel(const Host& host, std::unique_ptr<FrameConnection> logPort)
    : _host(host), _logPort(std::move(logPort)), _listener(host.log), _outbox(kHeldBytes)
{
    _logPort->closed = [this] { end(); };
    _logPort->readable = [this] { readLogPort(); };
    _logPort->written = [this] { flush(); };
    _listener.accepted = [this](auto connection) { accept(std::move(connection)); };
    _commandTimeout.setSingleShot(true);
    QObject::connect(&_commandTimeout, &QTimer::timeout, &_commandTimeout, [this] {
        _host.log.write(Priority::Warning, "Channel %s: no client connected to its command port", _name);
        end();
    });
}

ServiceChannel::~ServiceChannel()
{
    if (_outbox.dropped() > _reportedDrops)
        _host.log.write(Priority::Warning, "Channel %s: its client did not read, %lu messages were dropped", _name,
                        _outbox.dropped() - _reportedDrops);
}

std::optional<Problem> ServiceChannel::listen(const std::string& path)
{
    _name = std::filesystem::path(path).filename().string();
    _commandTimeout.start(kCommandTimeout);
    return _listener.listen(path);
}

void ServiceChannel::accept(std::unique_ptr<FrameConnection> connection)
{
    if (_commands) // a channel has one command connection
        return;
    _commandTimeout.stop();
    _commands = std::move(connection);
    _commands->closed = [this] { end(); };
    _commands->readable = _commands->written = [this] { readCommands(); };
}

void ServiceChannel::readCommands()
{
    // Commands of a client that does not read its replies stay in that client's socket.
    while (!_ended && _commands->unsent() < kUnsentReplies) {
        const auto frame = _commands->next();
        if (!frame)
            return;
        obey(*frame);
    }
}

// The client sends nothing on this port. Reading detects a malformed peer and keeps the socket's buffer empty.
void ServiceChannel::readLogPort()
{
    while (!_ended && _logPort->next())
        continue;
}

void ServiceChannel::obey(const Frame& frame)
{
    if (frame.messageId != vox::kLogMessage || frame.kind == Frame::Kind::Reply)
        return;
    const auto command = _host.lists.parse(frame.payload).dictionary();
    if (!command) {
        _host.log.write(Priority::Error, "Channel %s: a command that is not a dictionary (%lu bytes)", _name,
                        frame.payload.size());
        return;
    }
    if (command->contains("GetTechnology") && frame.kind == Frame::Kind::Request) {
        const auto reply = _host.lists.toXml(makeDictionary({{"GetTechnology", _host.technology()}}));
        if (reply && !_host.send(*_commands, {Frame::Kind::Reply, frame.messageId, frame.serial, reply->bytes()}))
            return end();
    }
    if (const auto state = command->at("SetState"); state.isText()) {
        if (state == "Streaming")
            _subscription.emplace(*command);
        else
            _subscription.reset();
        _host.streamingChanged();
    }
}

void ServiceChannel::stream(const Data& message)
{
    if (!_subscription || !_subscription->wants(message.bytes()))
        return;
    const std::size_t before = _outbox.dropped();
    _outbox.add(message);
    if (_outbox.dropped() > before && !std::exchange(_dropping, true))
        _host.log.write(Priority::Warning, "Channel %s: its client does not read, the oldest messages are dropped",
                        _name);
    flush();
}

void ServiceChannel::flush()
{
    while (_logPort->isOpen()) {
        if (_logPort->unsent() >= kSocketBytes)
            _logPort->push();
        if (_logPort->unsent() >= kSocketBytes)
            return; // `written` continues
        const auto message = _outbox.take();
        sendLosses();
        if (!message) {
            if (std::exchange(_dropping, false)) {
                const std::size_t dropped = _outbox.dropped() - std::exchange(_reportedDrops, _outbox.dropped());
                _host.log.write(
                    Priority::Warning,
                    formatted("Channel %s: its client reads again, %lu messages were dropped", _name, dropped));
            }
            return;
        }
        _host.send(*_logPort, {Frame::Kind::Message, vox::kLogMessage, 0, message->bytes()});
    }
}

// Sent where the messages are missing in the stream: before the next message.
void ServiceChannel::sendLosses()
{
    const std::uint64_t missing = _outbox.dropped() - std::exchange(_sentDrops, _outbox.dropped());
    if (missing == 0)
        return;
    std::array<std::byte, sizeof missing> payload;
    FieldWriter(payload).set64(0, missing);
    _host.send(*_logPort, {Frame::Kind::Message, vox::kLossMessage, 0, payload});
    _host.dropped(missing);
}

void ServiceChannel::end()
{
    if (!std::exchange(_ended, true))
        _host.ended(*this);
}

} // namespace kestrum
