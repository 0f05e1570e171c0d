#pragma once

#include <chrono>
#include <functional>
#include <memory>

namespace kestrum {

/// A repeating timer. Destroying the object stops it; the timer's action may do so.
class Timer {
public:
    virtual ~Timer() = default;
};

/// Runs tasks on the main thread, one after the other.
class MainQueue {
public:
    virtual ~MainQueue() = default;

    /// Runs `task` once, after `delay` or later, and never during this call. Tasks with the same time run in the order
    /// in which they were posted.
    virtual void post(std::chrono::milliseconds delay, std::function<void()> task) = 0;
    void post(std::function<void()> task) { post(std::chrono::milliseconds(0), std::move(task)); }

    /// Runs `action` every `interval`, for the first time after one interval, until the timer is destroyed.
    virtual std::unique_ptr<Timer> repeat(std::chrono::milliseconds interval, std::function<void()> action) = 0;
};

} // namespace kestrum
