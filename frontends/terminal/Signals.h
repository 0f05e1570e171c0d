#pragma once

#include <array>
#include <csignal>
#include <vector>

namespace kestrum {

/// The signals that a terminal's program answers, turned into something to read: their handlers may do next to nothing.
/// One object at a time; its end puts the old handlers back.
class Signals {
public:
    Signals();
    ~Signals();
    Signals(const Signals&) = delete;
    Signals& operator=(const Signals&) = delete;

    int descriptor() const; ///< readable when a signal has arrived
    /// What has arrived since the last call, each once.
    std::vector<int> taken();

private:
    static constexpr std::array kSignals = {SIGTERM, SIGHUP, SIGINT, SIGQUIT, SIGTSTP, SIGCONT, SIGWINCH};
    std::array<struct sigaction, kSignals.size()> _before;
    struct sigaction _ttouBefore;
};

} // namespace kestrum
