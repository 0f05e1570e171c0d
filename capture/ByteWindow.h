#pragma once

#include "support/Bytes.h"

#include <cstdint>
#include <functional>
#include <istream>
#include <span>
#include <vector>

namespace kestrum {

/// The unread rest of a file, a pipe or memory. Holds only as much of it as is looked at.
class ByteWindow {
public:
    /// Reads some bytes, waiting for them where it must; 0 at the (present) end.
    using Read = std::function<std::size_t(std::span<std::byte>)>;

    explicit ByteWindow(Read read) : _read(std::move(read)) {}
    /// The stream outlives the window.
    explicit ByteWindow(std::istream& stream);
    /// The bytes outlive the window.
    explicit ByteWindow(Bytes bytes);

    /// All bytes held, at least `count` unless the input ends before; valid until the next call.
    Bytes peek(std::size_t count);
    /// `count` is at most what was peeked.
    void skip(std::size_t count);
    /// Where in the input the window begins.
    std::uint64_t offset() const { return _offset; }
    /// Reads again where the input had ended: it may have grown.
    void resume() { _ended = false; }

private:
    Read _read;
    std::vector<std::byte> _held;
    std::size_t _begin = 0, _end = 0; ///< in `_held`
    std::uint64_t _offset = 0;
    bool _ended = false;
};

} // namespace kestrum
