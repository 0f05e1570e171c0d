#include "capture/ByteWindow.h"

#include <algorithm>

namespace kestrum {
namespace {

constexpr std::size_t kChunk = 256 << 10;

} // namespace

ByteWindow::ByteWindow(std::istream& stream)
    : ByteWindow([&stream](std::span<std::byte> into) {
          stream.read(reinterpret_cast<char*>(into.data()), static_cast<std::streamsize>(into.size()));
          return static_cast<std::size_t>(stream.gcount());
      })
{}

ByteWindow::ByteWindow(Bytes bytes)
    : ByteWindow([rest = bytes](std::span<std::byte> into) mutable {
          const auto count = std::min(into.size(), rest.size());
          std::ranges::copy(rest.first(count), into.begin());
          rest = rest.subspan(count);
          return count;
      })
{}

Bytes ByteWindow::peek(std::size_t count)
{
    while (_end - _begin < count && !_ended) {
        // Drops the bytes before the window when they are as many as those in it, so each byte moves once on average.
        if (_begin >= _end - _begin) {
            std::copy(_held.begin() + static_cast<std::ptrdiff_t>(_begin),
                      _held.begin() + static_cast<std::ptrdiff_t>(_end), _held.begin());
            _end -= _begin;
            _begin = 0;
        }
        if (_held.size() - _end < kChunk)
            _held.resize(std::max(_end + kChunk, _held.size() + _held.size() / 2));
        const auto got = _read(std::span(_held).subspan(_end, kChunk));
        _end += got;
        _ended = got == 0;
    }
    return Bytes(_held).subspan(_begin, _end - _begin);
}

void ByteWindow::skip(std::size_t count)
{
    _begin += count;
    _offset += count;
}

} // namespace kestrum
