#pragma once

#include "LogGenerator/State.h"
#include "support/Bytes.h"

#include <chrono>
#include <cstdint>

namespace kestrum {

class LogGenerator;

/// Follows a model: its messages, its displays in the order in which they are shown, and its connection.
class DisplayWatch {
public:
    virtual ~DisplayWatch() = default;

    /// A new display was made. `entry` is its entry of the history (StateKey): valid during the call, and its
    /// containers change with the next message.
    virtual void displayMade(const Dictionary& entry) = 0;
    /// The generator was given a message: it is in the state, unless it was invalid. Called up to thousands of times a
    /// second.
    virtual void messageDecoded(const LogGenerator&, const State&, Bytes) {}
    /// The service has dropped that number of messages, which this display did not read in time.
    virtual void messagesLost(std::uint64_t) {}
    /// The log channel is open, or was lost.
    virtual void connectionChanged(bool /*isConnected*/) {}
    /// So much time has passed while the log channel was open. By the queue's timer: no clock that is set matters.
    virtual void timePassed(std::chrono::milliseconds) {}
};

} // namespace kestrum
