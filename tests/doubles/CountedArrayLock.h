#pragma once

#include "LogGenerator/ArrayLock.h"
#include "platform/RecursiveMutex.h"

#include <functional>
#include <memory>

namespace kestrum {

/// Counts the calls of the array lock's mutex, as long as this object lives.
class CountedArrayLock {
public:
    CountedArrayLock() { ArrayLock::initialize(std::make_unique<Mutex>(*this)); }
    ~CountedArrayLock() { ArrayLock::initialize(std::make_unique<StandardRecursiveMutex>()); }
    CountedArrayLock(const CountedArrayLock&) = delete;
    CountedArrayLock& operator=(const CountedArrayLock&) = delete;

    int locked = 0, unlocked = 0;
    std::function<void()> onLock, onUnlock; ///< run while the mutex is locked

private:
    class Mutex final : public RecursiveMutex {
    public:
        explicit Mutex(CountedArrayLock& counts) : _counts(counts) {}
        void lock() override
        {
            ++_counts.locked;
            if (_counts.onLock)
                _counts.onLock();
        }
        void unlock() override
        {
            ++_counts.unlocked;
            if (_counts.onUnlock)
                _counts.onUnlock();
        }

    private:
        CountedArrayLock& _counts;
    };
};

} // namespace kestrum
