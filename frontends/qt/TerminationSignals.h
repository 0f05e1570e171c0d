#pragma once

#include <QSocketNotifier>
#include <csignal>
#include <functional>
#include <memory>

namespace kestrum::qt {

/// While it lives, SIGTERM, SIGINT and SIGHUP run `ended` from the main loop instead of killing the process. At most one.
class TerminationSignals final {
public:
    explicit TerminationSignals(std::function<void()> ended);
    ~TerminationSignals();
    TerminationSignals(const TerminationSignals&) = delete;
    TerminationSignals& operator=(const TerminationSignals&) = delete;

private:
    static constexpr int kSignals[] = {SIGTERM, SIGINT, SIGHUP};
    struct sigaction _before[std::size(kSignals)];
    std::unique_ptr<QSocketNotifier> _notifier;
};

} // namespace kestrum::qt
