#pragma once

#include "support/Bytes.h"

#include <cstddef>
#include <deque>
#include <vector>

namespace kestrum {

/// The raw messages of one refresh interval, one behind the other. Its size does not follow the peer's rate: at the
/// bound the oldest messages are dropped and counted.
class RawRecords {
public:
    static constexpr std::size_t kCapacity = 64 << 20; ///< bytes

    explicit RawRecords(std::size_t capacity = kCapacity) : _capacity(capacity) {}

    void append(Bytes message);

    struct Interval {
        std::vector<std::byte> bytes;
        std::size_t dropped = 0; ///< messages that are missing at the beginning
    };
    /// What was appended since the last call.
    Interval take();

private:
    // Whole messages. The oldest are dropped a block at a time, because nothing tells where a message in it ends.
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
