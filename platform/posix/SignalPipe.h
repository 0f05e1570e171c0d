#pragma once

#include <csignal>
#include <vector>

namespace kestrum {

/// Writes signals to a pipe, because a signal handler may do almost nothing else. One object at a time. The destructor
/// restores the old handlers.
class SignalPipe {
public:
    /// Throws std::system_error when no pipe can be created.
    explicit SignalPipe(std::vector<int> numbers);
    ~SignalPipe();
    SignalPipe(const SignalPipe&) = delete;
    SignalPipe& operator=(const SignalPipe&) = delete;

    int descriptor() const; ///< readable when a signal has arrived
    /// The signals that arrived since the last call, each once, in the order given to the constructor.
    std::vector<int> taken();

private:
    std::vector<int> _signals;
    std::vector<struct sigaction> _before;
};

} // namespace kestrum
