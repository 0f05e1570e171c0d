#pragma once

#include <csignal>
#include <vector>

namespace kestrum {

/// Signals turned into something to read: a handler may do next to nothing. One object at a time; its end puts the old
/// handlers back.
class SignalPipe {
public:
    /// std::system_error when there is no pipe to be had.
    explicit SignalPipe(std::vector<int> signals);
    ~SignalPipe();
    SignalPipe(const SignalPipe&) = delete;
    SignalPipe& operator=(const SignalPipe&) = delete;

    int descriptor() const; ///< readable when a signal has arrived
    /// What has arrived since the last call, each once, in the order given to the constructor.
    std::vector<int> taken();

private:
    std::vector<int> _signals;
    std::vector<struct sigaction> _before;
};

} // namespace kestrum
