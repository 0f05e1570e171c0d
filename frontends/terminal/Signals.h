#pragma once

#include <csignal>
#include <vector>

namespace kestrum {

/// The signals that a terminal's program answers, turned into something to read: their handlers may do next to nothing.
/// One object at a time; its end puts the old handlers back.
class Signals {
public:
    explicit Signals(std::vector<int> signals);
    ~Signals();
    Signals(const Signals&) = delete;
    Signals& operator=(const Signals&) = delete;

    int descriptor() const; ///< readable when a signal has arrived
    /// What has arrived since the last call, each once.
    std::vector<int> taken();

private:
    std::vector<int> _signals;
    std::vector<struct sigaction> _before;
};

} // namespace kestrum
