#pragma once

#include "support/Bytes.h"

#include <cstddef>
#include <deque>
#include <vector>

namespace kestrum {

/// The raw messages of one refresh interval, one after the other. Its memory is bounded: above `capacity` the oldest
/// messages are dropped and counted.
class RawRecords {
public:
    static constexpr std::size_t kCapacity = 64 << 20; ///< bytes

    explicit RawRecords(std::size_t capacity = kCapacity) : _capacity(capacity) {}

    void append(Bytes message);

    struct Interval {
        std::vector<std::byte> bytes;
        std::size_t dropped = 0; ///< messages missing at the beginning
    };
    /// The messages since the last call.
    Interval take();

private:
    // Whole messages. The oldest block is dropped as a whole, because it does not record where its messages end.
    struct Block {
        std::vector<std::byte> bytes;
        std::size_t messages = 0;
    };

    std::size_t _capacity;
    std::deque<Block> _full;
    std::size_t _fullBytes = 0;
    Block _newest;
    std::size_t _dropped = 0;
};

} // namespace kestrum
