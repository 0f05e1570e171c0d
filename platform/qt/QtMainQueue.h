#pragma once

#include "platform/MainQueue.h"

#include <QTimer>

#include <map>

namespace kestrum {

/// The main queue on the event loop of the thread that created it. Nested event loops serve it too.
class QtMainQueue final : public MainQueue {
public:
    QtMainQueue();
    ~QtMainQueue() override { clear(); }

    using MainQueue::post;
    void post(std::chrono::milliseconds delay, std::function<void()> task) override;
    std::unique_ptr<Timer> repeat(std::chrono::milliseconds interval, std::function<void()> action) override;

    /// Destroys all tasks and stops all timers. Call it while the other adapters exist: tasks may own users of them.
    void clear();

private:
    using Moment = std::chrono::steady_clock::time_point;
    struct Repetition;

    void post(Moment due, std::function<void()> task);
    void schedule(const std::shared_ptr<Repetition>& repetition);
    void wake();
    void runDue();

    // Sorted by time; tasks with the same time in the order in which they were posted.
    std::multimap<Moment, std::function<void()>> _tasks;
    unsigned _clearings = 0;
    QTimer _timer;
};

} // namespace kestrum
