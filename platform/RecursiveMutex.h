#pragma once

#include <memory>
#include <mutex>

namespace kestrum {

/// A lock that the thread holding it may take again.
class RecursiveMutex {
public:
    virtual ~RecursiveMutex() = default;
    virtual void lock() = 0;
    virtual void unlock() = 0;
};

/// std::recursive_mutex.
class StandardRecursiveMutex final : public RecursiveMutex {
public:
    void lock() override { _mutex.lock(); }
    void unlock() override { _mutex.unlock(); }

private:
    std::recursive_mutex _mutex;
};

} // namespace kestrum
