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

class DisplayWatch;
class Timer;

/// Receives the model's notifications, always from the main queue and never from inside a call of the model.
class KestrumModelObserver {
public:
    virtual ~KestrumModelObserver() = default;
    /// The display has new data.
    virtual void updateViewControllerFromModel() = 0;
    /// An attempt to start has ended: monitoring runs, or the model waits for the next attempt.
    virtual void updateStatus() = 0;
    /// The modem now runs another technology: the display that was shown is out of date.
    virtual void displayReplaced() = 0;
    /// The service has dropped messages that this display did not read in time; see `lostMessages`.
    virtual void messagesLost() = 0;
};

/// Connects the telephony service with the screens: owns the log channel, the generator, its state and the display
/// tree. Main thread only.
///
/// Always owned by shared_ptrs. The refresh timer and a pending retry own it too: while monitoring runs the model lives
/// until the queue's tasks and timers are destroyed.
class KestrumModel final : public std::enable_shared_from_this<KestrumModel> {
public:
    /// Opens nothing. The roles are borrowed and outlive the model.
    explicit KestrumModel(MonitorRoles& roles);
    /// Closes the channel.
    ~KestrumModel();
    KestrumModel(const KestrumModel&) = delete;
    KestrumModel& operator=(const KestrumModel&) = delete;

    /// Borrowed, may be null. Reset it before the observer is destroyed.
    void setObserver(KestrumModelObserver* observer) { _observer = observer; }
    /// Borrowed, may be null. Reset it before the watch is destroyed.
    void setWatch(DisplayWatch* watch) { _watch = watch; }

    /// Opens the channel, asks for the technology, starts the log and refreshes every 2 s. After a failure it closes
    /// the channel and tries again 5 s later. Does nothing while monitoring runs or is being started.
    void startMonitor();
    void restartMonitor();

    /// Whether the log channel is open in both directions.
    bool isConnected() const;
    /// Why the last attempt to connect failed; nothing when it did not, or when there is nothing to say.
    const std::optional<Problem>& connectionProblem() const { return _problem; }
    /// The number of messages that the service has dropped since the start because this display did not read them.
    std::uint64_t lostMessages() const { return _lostMessages; }
    /// The same as text for the user.
    std::string lossNotice() const;

    /// Decodes one log message. An invalid message is logged and has no other effect.
    void updateWithData(Bytes data);

    /// Checks that the channel is open, and rebuilds the display when messages have arrived since the last refresh.
    void refresh();

    /// The identifier of the modem's technology; empty without a generator.
    std::string_view technology() const { return _logGenerator ? _logGenerator->technology() : std::string_view(); }
    /// The root of the display tree, built when needed; null without a generator.
    KestrumModelNodeRef topLevelNodes();
    /// The node under a path, see `joinPath`; null when there is none.
    KestrumModelNodeRef nodeAtPath(const std::string& path);

    /// The contents of a snapshot: dictionaries with a "Description" each. The list is new, its entries are shared with
    /// the history. Null without a generator.
    ArrayRef getSaveContents() const;
    /// The same for a list of history entries instead of the newest ones.
    ArrayRef getSaveContents(ArrayRef history) const;

    // The log channel (LogChannel.cpp).

    /// Opens the channel. False, with a log line, when it cannot be opened; call `destroyPorts` then.
    bool createPorts();
    /// Stops the refresh timer and closes the channel. Can be called in any state.
    void destroyPorts();
    /// Asks the service for the modem's technology and creates its generator, or none for an unknown technology.
    /// Kept: without an answer the earlier generator stays in use.
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
    void tellDisplay() const;
    void tellConnection(bool isConnected) const;
    void dropTree();
    void notify(void (KestrumModelObserver::*message)());

    MonitorRoles& _roles;
    KestrumModelObserver* _observer = nullptr;
    DisplayWatch* _watch = nullptr;

    // Shared: a port that is closed during its wait for a reply must live until that call returns.
    std::shared_ptr<LocalPort> _recvPort;
    std::shared_ptr<RemotePort> _sendPort;
    std::unique_ptr<Timer> _displayUpdateTimer; ///< not null while monitoring runs
    bool _updated = false;                      ///< a message has arrived since the last refresh
    std::unique_ptr<LogGenerator> _logGenerator;
    State _state; ///< outlives every generator
    KestrumModelNodeRef _nodes;
    std::optional<PathDictionary> _nodesByPath; ///< present when `_nodes` is not null

    std::optional<Problem> _problem;
    std::uint64_t _lostMessages = 0;
    bool _lossPending = false; ///< a notification of lost messages is posted
    bool _starting = false;    ///< an attempt to start is running
    bool _retryPending = false;
};

} // namespace kestrum
