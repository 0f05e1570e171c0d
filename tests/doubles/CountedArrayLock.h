#pragma once

#include "LogGenerator/ArrayLock.h"
#include "platform/RecursiveMutex.h"

#include <memory>

namespace kestrum {

/// Counts how the array lock uses its mutex, for as long as this object lives.
class CountedArrayLock {
public:
    CountedArrayLock() { ArrayLock::initialize(std::make_unique<Mutex>(*this)); }
    ~CountedArrayLock() { ArrayLock::initialize(std::make_unique<StandardRecursiveMutex>()); }
    CountedArrayLock(const CountedArrayLock&) = delete;
    CountedArrayLock& operator=(const CountedArrayLock&) = delete;

    int locked = 0, unlocked = 0;

private:
    class Mutex final : public RecursiveMutex {
    public:
        explicit Mutex(CountedArrayLock& counts) : _counts(counts) {}
        void lock() override { ++_counts.locked; }
        void unlock() override { ++_counts.unlocked; }

    private:
        CountedArrayLock& _counts;
    };
};

} // namespace kestrum
