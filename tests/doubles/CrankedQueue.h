#pragma once

#include "doubles/VirtualClock.h"
#include "platform/MainQueue.h"

#include <algorithm>
#include <chrono>
#include <cstddef>
#include <functional>
#include <map>
#include <memory>
#include <utility>
#include <vector>

namespace kestrum {

/// A main queue whose time advances only when the test says so. It must outlive its users.
class CrankedQueue final : public MainQueue {
public:
    using Duration = std::chrono::milliseconds;

    CrankedQueue() = default;
    /// Moves this clock together with the queue's time.
    explicit CrankedQueue(VirtualClock& clock) : _clock(&clock) {}
    ~CrankedQueue() override { drop(); }
    CrankedQueue(const CrankedQueue&) = delete;
    CrankedQueue& operator=(const CrankedQueue&) = delete;

    using MainQueue::post;
    void post(Duration delay, std::function<void()> task) override { _due.emplace(_now + delay, std::move(task)); }

    std::unique_ptr<Timer> repeat(Duration interval, std::function<void()> action) override
    {
        auto shared = std::make_shared<std::function<void()>>(std::move(action));
        std::erase_if(_timers, [](const auto& each) { return each.expired(); });
        _timers.push_back(shared);
        schedule(_now + interval, interval, shared);
        return std::make_unique<Repetition>(std::move(shared));
    }

    /// Runs the tasks whose time has come, including those posted during the run.
    void run() { advance(Duration(0)); }

    /// Moves the time forward, and runs the tasks whose time comes, including those posted during the run.
    void advance(Duration by)
    {
        turn(by, [] { return false; });
    }

    /// As `advance`, but stops when `done` is true: a blocking wait runs the queue this way. Returns whether it is
    /// done.
    bool turn(Duration atMost, const std::function<bool()>& done)
    {
        const Duration end = _now + atMost;
        while (!done()) {
            if (_due.empty() || _due.begin()->first > end) {
                moveTo(end);
                return done();
            }
            auto next = _due.extract(_due.begin());
            moveTo(next.key());
            next.mapped()();
        }
        return true;
    }

    /// Drops all tasks and ends all timers, as the end of the program does.
    void drop()
    {
        // Destroying a dropped task may post another task or end timers.
        while (!_due.empty())
            std::exchange(_due, {}).clear();
        for (const auto& timer : std::exchange(_timers, {}))
            if (const auto action = timer.lock())
                std::exchange(*action, nullptr) = nullptr;
    }

    Duration now() const { return _now; }
    /// The number of running timers.
    std::size_t timers() const
    {
        return static_cast<std::size_t>(
            std::ranges::count_if(_timers, [](const auto& each) { return !each.expired(); }));
    }
    /// The number of waiting tasks, without the timers' tasks.
    std::size_t tasks() const
    {
        return static_cast<std::size_t>(
            std::ranges::count_if(_due, [](const auto& each) { return !each.second.template target<Tick>(); }));
    }

private:
    using Action = std::shared_ptr<std::function<void()>>;

    /// Owns the action and everything it holds. Both are destroyed together with the timer.
    class Repetition final : public Timer {
    public:
        explicit Repetition(Action action) : _action(std::move(action)) {}

    private:
        Action _action;
    };

    struct Tick {
        CrankedQueue* queue;
        Duration due, interval;
        std::weak_ptr<std::function<void()>> timer;

        void operator()() const
        {
            const auto action = timer.lock();
            if (!action || !*action)
                return;
            (*action)();
            // Scheduled after the action, so that a wait inside it does not run it again. The action may have ended
            // its timer.
            constexpr int kThisCall = 1;
            if (action.use_count() > kThisCall && *action)
                queue->schedule(std::max(due + interval, queue->_now), interval, action);
        }
    };

    void schedule(Duration due, Duration interval, const Action& action)
    {
        _due.emplace(due, Tick{this, due, interval, action});
    }

    // A wait inside a task has already moved the time.
    void moveTo(Duration time)
    {
        if (time <= _now)
            return;
        if (_clock != nullptr)
            _clock->date += time - _now;
        _now = time;
    }

    VirtualClock* _clock = nullptr;
    Duration _now{0};
    std::multimap<Duration, std::function<void()>> _due;
    std::vector<std::weak_ptr<std::function<void()>>> _timers;
};

} // namespace kestrum
