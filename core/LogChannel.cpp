// The model's log channel: opening, closing, choice of the generator, received messages.
#include "core/KestrumModel.h"

#include "core/DisplayWatch.h"
#include "platform/MainQueue.h"
#include "platform/PropertyLists.h"
#include "platform/SystemLog.h"
#include "platform/TelephonyService.h"
#include "support/Format.h"
#include "support/Record.h"

#include <chrono>
#include <limits>
#include <utility>

namespace kestrum {
namespace {

using namespace std::chrono_literals;

constexpr std::int32_t kMessageId = 0; // commands and log messages
constexpr std::int32_t kLossId = 1;    // from the service: how many messages it dropped before the next one
constexpr auto kSendTimeout = 1s;
constexpr auto kReplyTimeout = 1s;
constexpr std::int32_t kNoPort = -1; // the status of a message when no port is open

constexpr std::string_view kGetTechnology = "GetTechnology";

} // namespace

bool KestrumModel::createPorts()
{
    const auto self = shared_from_this();
    _recvPort = _roles.ports.createLocal(
        kLogChannelServiceName, [this](std::int32_t messageId, Bytes payload) { handleMessage(messageId, payload); });
    // Kept: a missing local port does not end the attempt here. The service refuses the channel, and its answer is
    // logged.
    if (_recvPort) {
        _recvPort->setDeliveryQueue(_roles.queue);
        _recvPort->setInvalidationHandler([this, port = _recvPort.get()] { handleInvalidation(port); });
    }

    const auto recvPort = _recvPort;
    auto connection = _roles.telephony.connect([this](std::string_view) { refresh(); });
    if (!connection) {
        logError("Could not create VoxServerConnection");
        return false;
    }
    const auto answer = connection->networkMonitorCreateLogChannel(kLogChannelServiceName);
    connection.reset();
    if (answer.errorCode != 0) {
        logError(formatted("_VoxServerConnectionNetworkMonitorCreateLogChannel returns error: %ld!",
                           static_cast<long>(answer.errorCode)));
        return false;
    }
    if (!answer.remotePort || answer.remotePort->empty()) {
        logError("Could not create a log channel (Vox returned null port)!");
        return false;
    }
    // The wait for the answer serves tasks. One of them may have closed the channel.
    if (_recvPort != recvPort)
        return false;
    _sendPort = _roles.ports.createRemote(*answer.remotePort);
    if (!_sendPort) {
        logError("Could not create the remote port!");
        return false;
    }
    logError(formatted(" ***** Created ports (send=%p, recv=%p)", _roles.log.shownAddress(_sendPort.get()),
                       _roles.log.shownAddress(_recvPort.get())));
    return true;
}

void KestrumModel::destroyPorts()
{
    // Keeps the model alive: the timer may be its last owner. Null when the destructor calls.
    const auto self = weak_from_this().lock();
    std::exchange(_displayUpdateTimer, nullptr).reset();
    const auto close = [](auto& field) {
        if (const auto port = std::exchange(field, nullptr)) {
            port->setInvalidationHandler({}); // closed by the model itself: no restart
            port->invalidate();
        }
    };
    close(_recvPort);
    close(_sendPort);
}

bool KestrumModel::isConnected() const
{
    return _recvPort && _sendPort;
}

void KestrumModel::configureGenerator()
{
    const auto request = _roles.propertyLists.toXml(makeDictionary({{std::string(kGetTechnology), kGetTechnology}}));
    if (!request)
        return logError(" Could not generate GetTechnology command; cannot configure");
    const auto sent = send(request->bytes(), RemotePort::Reply::Awaited);
    if (sent.status != 0)
        return logError(formatted(" ***** Could not send the GetTechnology command (got error=%d)", sent.status));
    if (!sent.reply)
        return logError(" ***** No response to GetTechnology; cannot configure");
    const Value reply = _roles.propertyLists.parse(sent.reply->bytes());
    if (!reply)
        return logError(" ***** Could not parse reply to GetTechnology; cannot configure");
    const auto dictionary = reply.dictionary();
    const Value technology = dictionary ? dictionary->at(kGetTechnology) : Value();
    if (!technology)
        return logError(" ***** Reply to GetTechnology had no answer; cannot configure");
    takeGenerator(LogGenerator::generatorFromTechnology(technology, _roles));
}

void KestrumModel::takeGenerator(std::unique_ptr<LogGenerator> generator)
{
    _logGenerator = std::move(generator);
    logError(formatted("Got log generated: %p", _roles.log.shownAddress(_logGenerator.get())));
    if (_logGenerator && _logGenerator->replacesDisplayOf(_state)) {
        dropTree();
        notify(&KestrumModelObserver::displayReplaced);
    }
}

RemotePort::Sent KestrumModel::send(Bytes payload, RemotePort::Reply reply)
{
    const auto port = _sendPort; // a copy: the wait may close the port
    if (!port)
        return {kNoPort, std::nullopt};
    return port->sendRequest(kMessageId, payload, kSendTimeout,
                             reply == RemotePort::Reply::Awaited ? kReplyTimeout : 0s, reply);
}

void KestrumModel::handleMessage(std::int32_t messageId, Bytes payload)
{
    if (messageId == kMessageId)
        updateWithData(payload);
    else if (messageId == kLossId)
        countLost(payload);
}

// Only counts: history, raw records and DLF hold nothing but what the modem sent.
void KestrumModel::countLost(Bytes payload)
{
    const auto low = Record(payload).read(u32(0)), high = Record(payload).read(u32(4));
    const std::uint64_t count = low && high ? std::uint64_t{*high} << 32 | *low : 0;
    if (count == 0)
        return;
    const auto most = std::numeric_limits<std::uint64_t>::max();
    _lostMessages = count > most - _lostMessages ? most : _lostMessages + count;
    if (_watch != nullptr)
        _watch->messagesLost(count);
    // A slow display gets many of these messages. One task reports all that arrive before it runs.
    if (std::exchange(_lossPending, true))
        return;
    _roles.queue.post([model = weak_from_this()] {
        const auto self = model.lock();
        if (!self)
            return;
        self->_lossPending = false;
        if (self->_observer != nullptr)
            self->_observer->messagesLost();
    });
}

void KestrumModel::handleInvalidation(const Port* port)
{
    logError(formatted(" ***** INVALIDATED %p *****", _roles.log.shownAddress(port)));
    restartMonitor();
}

} // namespace kestrum
