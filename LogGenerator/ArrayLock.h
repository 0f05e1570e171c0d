#pragma once

#include <memory>

namespace kestrum {

class RecursiveMutex;

/// The lock of all array nodes of the display. Sections hold it while they rewrite an array, the builder of the display
/// tree while it walks one.
///
/// Kept: every `lockArray` locks the mutex, but `unlockArray` unlocks it only when the 8-bit depth returns to 0. After
/// a nested pair the thread still holds the mutex. That blocks nothing while only one thread uses the lock, which a
/// debug build checks.
class ArrayLock {
public:
    /// Sets the mutex, and the depth to 0. Without this call the first use takes StandardRecursiveMutex.
    static void initialize(std::unique_ptr<RecursiveMutex> mutex);

    static void lockArray();
    static void unlockArray();
};

/// Holds the lock for a scope.
class ArrayLocked {
public:
    ArrayLocked() { ArrayLock::lockArray(); }
    ~ArrayLocked() { ArrayLock::unlockArray(); }
    ArrayLocked(const ArrayLocked&) = delete;
    ArrayLocked& operator=(const ArrayLocked&) = delete;
};

} // namespace kestrum
