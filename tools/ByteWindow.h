#pragma once

#include "support/Bytes.h"

#include <cstdint>
#include <functional>
#include <span>
#include <vector>

namespace kestrum {

/// What is still to be read of a file, a pipe or memory, seen from its beginning. Holds as much as is looked at.
class ByteWindow {
public:
    /// Reads some bytes, blocking if need be; 0 when there are none (for now).
    using Read = std::function<std::size_t(std::span<std::byte>)>;

    explicit ByteWindow(Read read) : _read(std::move(read)) {}
    /// Of bytes that outlive it.
    explicit ByteWindow(Bytes bytes);

    /// All that is at hand, at least `count` bytes unless the input ends before; valid until the next call.
    Bytes peek(std::size_t count);
    /// `count` is not above what was peeked.
    void skip(std::size_t count);
    /// Where in the input the window begins.
    std::uint64_t offset() const { return _offset; }
    /// An end that was met need not be one any more.
    void resume() { _ended = false; }

private:
    Read _read;
    std::vector<std::byte> _held;
    std::size_t _begin = 0, _end = 0; ///< in `_held`
    std::uint64_t _offset = 0;
    bool _ended = false;
};

} // namespace kestrum
