#pragma once

#include <cstddef>
#include <memory>
#include <span>
#include <string_view>
#include <utility>
#include <vector>

namespace kestrum {

/// Borrowed bytes: they must outlive the view.
using Bytes = std::span<const std::byte>;

/// The bytes of a text, borrowed.
inline Bytes bytesOf(std::string_view text)
{
    return std::as_bytes(std::span(text.data(), text.size()));
}

/// Bytes as text, borrowed; no encoding is checked.
inline std::string_view textOf(Bytes bytes)
{
    return {reinterpret_cast<const char*>(bytes.data()), bytes.size()};
}

/// Immutable bytes. Copies share the storage, so the raw records of an interval exist once.
class Data {
public:
    Data() = default;
    explicit Data(std::vector<std::byte> bytes)
        : _bytes(std::make_shared<const std::vector<std::byte>>(std::move(bytes)))
    {}
    explicit Data(Bytes bytes) : Data(std::vector<std::byte>(bytes.begin(), bytes.end())) {}

    Bytes bytes() const { return _bytes ? Bytes(*_bytes) : Bytes(); }
    std::size_t size() const { return bytes().size(); }
    bool empty() const { return size() == 0; }

    /// Whether both use the same storage. Equal bytes in different storage: false.
    bool sharesStorageWith(const Data& other) const { return _bytes == other._bytes; }

private:
    std::shared_ptr<const std::vector<std::byte>> _bytes;
};

} // namespace kestrum
