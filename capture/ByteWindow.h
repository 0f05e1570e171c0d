#pragma once

#include "support/Bytes.h"

#include <cstdint>
#include <functional>
#include <istream>
#include <span>
#include <vector>

namespace kestrum {

/// The unread rest of a file, a pipe or memory. Buffers only the bytes that were peeked.
class ByteWindow {
public:
    /// Reads some bytes, and waits for them if necessary. 0 at the end, which may be the end only for now.
    using Read = std::function<std::size_t(std::span<std::byte>)>;

    explicit ByteWindow(Read read) : _read(std::move(read)) {}
    /// The stream outlives the window.
    explicit ByteWindow(std::istream& stream);
    /// The bytes outlive the window.
    explicit ByteWindow(Bytes bytes);

    /// The buffered bytes, at least `count` unless the input ends before. Valid until the next call.
    Bytes peek(std::size_t count);
    /// Skips bytes. `count` is at most the size of the last peek.
    void skip(std::size_t count);
    /// The offset of the window's beginning in the input.
    std::uint64_t offset() const { return _offset; }
    /// Allows reading after the end of the input: the input may have grown.
    void resume() { _ended = false; }

private:
    Read _read;
    std::vector<std::byte> _held;
    std::size_t _begin = 0, _end = 0; ///< in `_held`
    std::uint64_t _offset = 0;
    bool _ended = false;
};

} // namespace kestrum
