#pragma once

#include <memory>

namespace kestrum {

class RecursiveMutex;

/// The one lock of the display's array nodes: sections hold it while they rewrite an array, the display-tree
/// builder while it walks one.
///
/// Deliberately lopsided: every `lockArray` locks the mutex, `unlockArray` unlocks it only when the 8-bit depth is
/// back at 0. A nested pair so leaves the mutex held by its thread, which never blocks as long as one thread does
/// it all; a debug build checks that.
class ArrayLock {
public:
    /// Starts over with that mutex, at depth 0. Without it the first use starts with the standard library's.
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
