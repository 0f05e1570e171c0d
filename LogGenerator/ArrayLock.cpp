#include "LogGenerator/ArrayLock.h"

#include "platform/RecursiveMutex.h"

#include <cassert>
#include <cstdint>
#include <thread>
#include <utility>

namespace kestrum {
namespace {

struct Shared {
    std::unique_ptr<RecursiveMutex> mutex = std::make_unique<StandardRecursiveMutex>();
    std::uint8_t depth = 0;
    std::thread::id user; // of the first lock; after a nested use another thread would never get the lock
};

Shared& shared()
{
    static Shared theOne;
    return theOne;
}

} // namespace

void ArrayLock::initialize(std::unique_ptr<RecursiveMutex> mutex)
{
    shared() = Shared{std::move(mutex), 0, {}};
}

void ArrayLock::lockArray()
{
    Shared& lock = shared();
    assert((lock.user == std::thread::id() || lock.user == std::this_thread::get_id()) &&
           "one thread decodes in a process");
    lock.user = std::this_thread::get_id();
    lock.mutex->lock();
    ++lock.depth;
}

void ArrayLock::unlockArray()
{
    Shared& lock = shared();
    if (--lock.depth == 0)
        lock.mutex->unlock();
}

} // namespace kestrum
