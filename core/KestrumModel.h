#pragma once

#include "LogGenerator/LogGenerator.h"
#include "core/KestrumModelNode.h"
#include "platform/MessagePorts.h"
#include "platform/Roles.h"
#include "support/Bytes.h"
#include "support/Problem.h"
#include "support/Value.h"

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace kestrum {

class Timer;

/// Whom the model tells of its changes: always from the main queue, never from inside a call of the model.
class KestrumModelObserver {
public:
    virtual ~KestrumModelObserver() = default;
    /// New data has come since the display was last asked for.
    virtual void updateViewControllerFromModel() = 0;
    /// An attempt to start has ended: monitoring runs, or the next attempt is waited for.
    virtual void updateStatus() = 0;
    /// The modem runs another technology than the one whose display was shown: nothing of that is current.
    virtual void displayReplaced() = 0;
    /// The service has dropped messages that this display did not take in time; see `lostMessages`.
    virtual void messagesLost() = 0;
};

/// The one object between the telephony service and the screens: owns the log channel, the generator, its state and
/// the display tree. Main thread only.
///
/// Always held by a shared_ptr. The refresh timer and a waiting retry hold it too: while monitoring runs the model
/// lives on when its owner lets it go, until the queue's tasks and timers are dropped.
class KestrumModel final : public std::enable_shared_from_this<KestrumModel> {
public:
    /// Opens nothing yet. The roles are borrowed, and outlive the model.
    explicit KestrumModel(MonitorRoles& roles);
    /// Closes the channel.
    ~KestrumModel();
    KestrumModel(const KestrumModel&) = delete;
    KestrumModel& operator=(const KestrumModel&) = delete;

    /// Borrowed; null for nobody. Whoever goes before the model takes itself out.
    void setObserver(KestrumModelObserver* observer) { _observer = observer; }

    /// Opens the channel, asks for the technology, has the log started and refreshes every 2 s. Every failure closes
    /// the channel and is tried again 5 s later. Nothing happens while monitoring runs or is being started.
    void startMonitor();
    void restartMonitor();

    /// The log channel is open in both directions.
    bool isConnected() const;
    /// Why the last attempt to connect failed; nothing when it did not, or when there is nothing to say.
    const std::optional<Problem>& connectionProblem() const { return _problem; }
    /// Log messages that the service has dropped because this display did not take them in time, since the start.
    std::uint64_t lostMessages() const { return _lostMessages; }
    /// The same in words for a person.
    std::string lossNotice() const;

    /// Takes one log message. What it holds can be nonsense: it is logged, and the next message is served.
    void updateWithData(Bytes data);

    /// Looks after the channel, and has the display rebuilt when messages have come since the last time.
    void refresh();

    /// The root of the display tree, built when there is none; null without a generator.
    KestrumModelNodeRef topLevelNodes();
    /// The node under a path, see `joinPath`; null when there is none.
    KestrumModelNodeRef nodeAtPath(const std::string& path);

    /// What a snapshot can hold: dictionaries, each with a "Description". The list is the caller's, its entries are
    /// the history's own. Null without a generator.
    ArrayRef getSaveContents() const;

    // The log channel (LogChannel.cpp).

    /// Opens the channel. False when it cannot be opened, which is logged; what was opened stays for `destroyPorts`.
    bool createPorts();
    /// Stops the refresh timer and closes the channel; harmless in any state.
    void destroyPorts();
    /// Asks the service which technology the modem runs, and takes that technology's generator, or none for a
    /// technology without one. When there is no answer the earlier generator stays, on purpose.
    void configureGenerator();

private:
    /// Why an attempt to start failed; nothing when it did not.
    std::optional<Problem> failureOfAttempt();
    std::optional<Problem> problemOfAttempt() const;
    void scheduleRetry();

    void handleMessage(std::int32_t messageId, Bytes payload);
    void countLost(Bytes payload);
    void handleInvalidation(const Port* port);
    RemotePort::Sent send(Bytes payload, RemotePort::Reply reply);
    void takeGenerator(std::unique_ptr<LogGenerator> generator);

    void logError(std::string_view text) const;
    void dropTree();
    void notify(void (KestrumModelObserver::*message)());

    MonitorRoles& _roles;
    KestrumModelObserver* _observer = nullptr;

    // Shared, so that a port which is closed while it waits for its reply lives to the end of that call.
    std::shared_ptr<LocalPort> _recvPort;
    std::shared_ptr<RemotePort> _sendPort;
    std::unique_ptr<Timer> _displayUpdateTimer; ///< there while monitoring runs
    bool _updated = false;                      ///< a message has come since the last refresh
    std::unique_ptr<LogGenerator> _logGenerator;
    State _state; ///< outlives every generator
    KestrumModelNodeRef _nodes;
    std::optional<PathDictionary> _nodesByPath; ///< there when `_nodes` is

    std::optional<Problem> _problem;
    std::uint64_t _lostMessages = 0;
    bool _lossPending = false; ///< the observer has not been told yet
    bool _starting = false;    ///< an attempt is on the stack
    bool _retryPending = false;
};

} // namespace kestrum
