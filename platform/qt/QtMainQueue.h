#pragma once

#include "platform/MainQueue.h"

#include <QTimer>

#include <map>

namespace kestrum {

/// The main queue on the event loop of the thread that made it; nested loops serve it too.
class QtMainQueue final : public MainQueue {
public:
    QtMainQueue();
    ~QtMainQueue() override { clear(); }

    using MainQueue::post;
    void post(std::chrono::milliseconds delay, std::function<void()> task) override;
    std::unique_ptr<Timer> repeat(std::chrono::milliseconds interval, std::function<void()> action) override;

    /// Drops all tasks and ends all timers, so that what they hold goes while the other adapters still stand.
    void clear();

private:
    using Moment = std::chrono::steady_clock::time_point;
    struct Repetition;

    void post(Moment due, std::function<void()> task);
    void schedule(const std::shared_ptr<Repetition>& repetition);
    void wake();
    void runDue();

    // In order of their moments; of equal moments in the order posted.
    std::multimap<Moment, std::function<void()>> _tasks;
    unsigned _clearings = 0;
    QTimer _timer;
};

} // namespace kestrum
