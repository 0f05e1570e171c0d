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

/// A main queue that stands until the test turns it. It outlives what it is given to.
class CrankedQueue final : public MainQueue {
public:
    using Duration = std::chrono::milliseconds;

    CrankedQueue() = default;
    /// Moves the clock along with its own time.
    explicit CrankedQueue(VirtualClock& clock) : _clock(&clock) {}
    ~CrankedQueue() override { drop(); }
    CrankedQueue(const CrankedQueue&) = delete;
    CrankedQueue& operator=(const CrankedQueue&) = delete;

    using MainQueue::post;
    void post(Duration delay, std::function<void()> task) override { _due.emplace(_now + delay, std::move(task)); }

    std::unique_ptr<Timer> repeat(Duration interval, std::function<void()> action) override
    {
        auto shared = std::make_shared<std::function<void()>>(std::move(action));
        _timers.push_back(shared);
        schedule(_now + interval, interval, shared);
        return std::make_unique<Repetition>(std::move(shared));
    }

    /// Runs what is due by now, tasks posted meanwhile included.
    void run() { advance(Duration(0)); }

    /// Moves the time, running what falls due, tasks posted meanwhile included.
    void advance(Duration by)
    {
        turn(by, [] { return false; });
    }

    /// As `advance`, but only until `done`: so a blocking wait serves the queue. Whether it is done.
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

    /// Drops all tasks and ends all timers, as the program's end does.
    void drop()
    {
        // What a dropped task held may post again, or end timers, while it goes.
        while (!_due.empty())
            std::exchange(_due, {}).clear();
        for (const auto& timer : std::exchange(_timers, {}))
            if (const auto action = timer.lock())
                std::exchange(*action, nullptr) = nullptr;
    }

    Duration now() const { return _now; }
    /// Running timers.
    std::size_t timers() const
    {
        return static_cast<std::size_t>(
            std::ranges::count_if(_timers, [](const auto& each) { return !each.expired(); }));
    }
    /// Waiting tasks, those of timers not counted.
    std::size_t tasks() const
    {
        return static_cast<std::size_t>(
            std::ranges::count_if(_due, [](const auto& each) { return !each.second.template target<Tick>(); }));
    }

private:
    using Action = std::shared_ptr<std::function<void()>>;

    /// Owns the action, and so what it holds: both go when the timer does.
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
            // Only now: a wait within the action does not run the action again. Its timer may have gone in it.
            constexpr int kThisCall = 1;
            if (action.use_count() > kThisCall && *action)
                queue->schedule(std::max(due + interval, queue->_now), interval, action);
        }
    };

    void schedule(Duration due, Duration interval, const Action& action)
    {
        _due.emplace(due, Tick{this, due, interval, action});
    }

    // A wait within a task has moved the time already.
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
