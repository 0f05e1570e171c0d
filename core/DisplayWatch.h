#pragma once

#include "LogGenerator/State.h"
#include "support/Bytes.h"

#include <chrono>

namespace kestrum {

class LogGenerator;

/// Follows a model: its messages, its displays in the order in which they are shown, and its connection.
class DisplayWatch {
public:
    virtual ~DisplayWatch() = default;

    /// A new display was made. `entry` is its entry of the history (StateKey): valid during the call, and its
    /// containers change with the next message.
    virtual void displayMade(const Dictionary& entry) = 0;
    /// The generator has read a message into the state. Called up to thousands of times a second.
    virtual void messageDecoded(const LogGenerator&, const State&, Bytes) {}
    /// The log channel is open, or was lost.
    virtual void connectionChanged(bool /*isConnected*/) {}
    /// So much time has passed while the log channel was open. By the queue's timer: no clock that is set matters.
    virtual void timePassed(std::chrono::milliseconds) {}
};

} // namespace kestrum
