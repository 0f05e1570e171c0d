#include "core/KestrumModel.h"

#include "core/DisplayWatch.h"
#include "platform/MainQueue.h"
#include "platform/PropertyLists.h"
#include "platform/SystemLog.h"
#include "platform/TelephonyService.h"
#include "support/Format.h"
#include "support/ScopedFlag.h"

#include <chrono>
#include <exception>
#include <utility>

namespace kestrum {
namespace {

using namespace std::chrono_literals;

constexpr auto kRefreshInterval = 2s;
constexpr auto kRetryDelay = 5s;

} // namespace

KestrumModel::KestrumModel(MonitorRoles& roles) : _roles(roles) {}

KestrumModel::~KestrumModel()
{
    destroyPorts();
}

void KestrumModel::startMonitor()
{
    // The wait for a reply serves timers and messages, which may call this function.
    if (_displayUpdateTimer || _starting)
        return;
    const auto self = shared_from_this();
    const auto failure = failureOfAttempt();
    _problem = failure ? problemOfAttempt() : std::nullopt;
    if (failure) {
        logError(failure->text);
        destroyPorts();
        scheduleRetry();
    } else {
        logError("Starting the display update timer");
        _displayUpdateTimer = _roles.queue.repeat(kRefreshInterval, [self] {
            if (self->_watch)
                self->_watch->timePassed(kRefreshInterval);
            self->refresh();
        });
        tellConnection(true);
    }
    notify(&KestrumModelObserver::updateStatus);
}

std::optional<Problem> KestrumModel::failureOfAttempt()
{
    const ScopedFlag starting(_starting);
    if (!createPorts())
        return Problem{"Could not create the ports necessary"};
    configureGenerator();
    if (!_logGenerator)
        return Problem{"No log generator technology works"};
    const auto command = _roles.propertyLists.toXml(_logGenerator->getStartCommand());
    if (!command)
        return Problem{" Could not generate PLIST"};
    const auto sent = send(command->bytes(), RemotePort::Reply::None);
    if (sent.status != 0)
        return Problem{formatted(" ***** Could not send the START command (got error=%d)", sent.status)};
    return std::nullopt;
}

std::optional<Problem> KestrumModel::problemOfAttempt() const
{
    if (auto problem = _roles.telephony.problem())
        return problem;
    if (!_sendPort)
        return std::nullopt;
    return Problem{"The telephony service does not say which technology the modem runs."};
}

void KestrumModel::scheduleRetry()
{
    if (std::exchange(_retryPending, true))
        return;
    _roles.queue.post(kRetryDelay, [self = shared_from_this()] {
        self->_retryPending = false;
        self->startMonitor();
    });
}

void KestrumModel::restartMonitor()
{
    const auto self = shared_from_this();
    if (_displayUpdateTimer)
        tellConnection(false);
    destroyPorts();
    startMonitor();
}

void KestrumModel::updateWithData(Bytes data)
{
    const auto self = shared_from_this();
    if (_logGenerator) {
        try {
            _logGenerator->updateState(_state, data);
        } catch (const std::exception& failure) {
            logError(failure.what());
        }
        if (_watch)
            _watch->messageDecoded(*_logGenerator, _state, data);
    }
    _updated = true;
}

void KestrumModel::refresh()
{
    const auto self = shared_from_this();
    if (_sendPort && _recvPort && !_sendPort->isValid())
        _recvPort->invalidate();
    if (!std::exchange(_updated, false))
        return;
    dropTree();
    notify(&KestrumModelObserver::updateViewControllerFromModel);
}

KestrumModelNodeRef KestrumModel::topLevelNodes()
{
    if (!_nodes && _logGenerator) {
        const Value display = _logGenerator->generateLogUsingState(_state);
        _nodesByPath.emplace();
        _nodes = KestrumModelNode::makeTreeFromObject(display, *_nodesByPath);
        tellDisplay();
    }
    return _nodes;
}

void KestrumModel::tellDisplay() const
{
    const Value* history = _watch ? _state.find(StateKey::kHistory) : nullptr;
    const Array* entries = history ? history->borrowedArray() : nullptr;
    if (entries && !entries->empty())
        if (const Dictionary* newest = entries->back().borrowedDictionary())
            _watch->displayMade(*newest);
}

void KestrumModel::tellConnection(bool isConnected) const
{
    if (_watch)
        _watch->connectionChanged(isConnected);
}

KestrumModelNodeRef KestrumModel::nodeAtPath(const std::string& path)
{
    if (!_nodesByPath)
        topLevelNodes();
    return _nodesByPath ? _nodesByPath->find(path) : nullptr;
}

std::string KestrumModel::lossNotice() const
{
    return formatted("The telephony service dropped %lu messages: this display was too slow for them",
                     static_cast<unsigned long>(_lostMessages));
}

ArrayRef KestrumModel::getSaveContents() const
{
    return _logGenerator ? _logGenerator->getSaveContentsFromState(_state) : nullptr;
}

ArrayRef KestrumModel::getSaveContents(ArrayRef history) const
{
    State state;
    state.set(StateKey::kHistory, std::move(history));
    return _logGenerator ? _logGenerator->getSaveContentsFromState(state) : nullptr;
}

void KestrumModel::dropTree()
{
    _nodes = nullptr;
    _nodesByPath.reset();
}

void KestrumModel::notify(void (KestrumModelObserver::*message)())
{
    _roles.queue.post([model = weak_from_this(), message] {
        if (const auto self = model.lock(); self && self->_observer != nullptr)
            (self->_observer->*message)();
    });
}

void KestrumModel::logError(std::string_view text) const
{
    _roles.log.write(Priority::Error, text);
}

} // namespace kestrum
