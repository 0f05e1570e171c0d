#pragma once

#include <functional>
#include <memory>

namespace kestrum {

/// Turns SIGTERM, SIGINT and SIGHUP into a call from the event loop. One at a time in a program, made once its Qt
/// application object stands (std::system_error when there is no pipe for signals); at its end the signals do what they
/// did before.
class TerminationSignals {
public:
    /// `action` runs once for the signals that came since its last run. It must not destroy this object.
    explicit TerminationSignals(std::function<void()> action);
    ~TerminationSignals();

private:
    struct Watch;
    std::unique_ptr<Watch> _watch;
};

} // namespace kestrum
