#pragma once

#include <functional>
#include <memory>

namespace kestrum {

/// Turns SIGTERM, SIGINT and SIGHUP into a call from the event loop. One object at a time, created after the Qt
/// application object. Throws std::system_error when no pipe can be created. The destructor restores the old handlers.
class TerminationSignals {
public:
    /// `action` runs once for all signals since its last run. It must not destroy this object.
    explicit TerminationSignals(std::function<void()> action);
    ~TerminationSignals();

private:
    struct Watch;
    std::unique_ptr<Watch> _watch;
};

} // namespace kestrum
