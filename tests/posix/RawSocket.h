#pragma once

#include "support/Bytes.h"

#include <cstdint>
#include <cstring>
#include <string>
#include <string_view>

#include <poll.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

namespace kestrum {

/// A peer that follows no protocol: a plain socket that sends whatever bytes the test gives it.
class RawSocket {
public:
    explicit RawSocket(int descriptor) : _descriptor(descriptor) {}
    RawSocket(RawSocket&& other) noexcept : _descriptor(std::exchange(other._descriptor, -1)) {}
    RawSocket& operator=(RawSocket&&) = delete;
    ~RawSocket() { close(); }

    static RawSocket connectTo(const std::string& path)
    {
        const int made = ::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0);
        const auto address = at(path);
        if (::connect(made, reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0) {
            ::close(made);
            return RawSocket(-1);
        }
        return RawSocket(made);
    }
    static RawSocket listenAt(const std::string& path, int backlog = 8)
    {
        const int made = ::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0);
        const auto address = at(path);
        if (::bind(made, reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0 ||
            ::listen(made, backlog) != 0) {
            ::close(made);
            return RawSocket(-1);
        }
        return RawSocket(made);
    }
    RawSocket accept() const { return RawSocket(::accept4(_descriptor, nullptr, nullptr, SOCK_CLOEXEC)); }

    bool isOpen() const { return _descriptor >= 0; }
    bool send(std::string_view bytes) const
    {
        return ::send(_descriptor, bytes.data(), bytes.size(), MSG_NOSIGNAL) == static_cast<ssize_t>(bytes.size());
    }
    /// Sends as much as fits, without waiting.
    ssize_t sendSome(std::string_view bytes) const
    {
        return ::send(_descriptor, bytes.data(), bytes.size(), MSG_NOSIGNAL | MSG_DONTWAIT);
    }
    /// Returns the bytes that have arrived, without waiting.
    std::string received() const
    {
        std::string all;
        char piece[4096];
        for (ssize_t n; (n = ::recv(_descriptor, piece, sizeof piece, MSG_DONTWAIT)) > 0;)
            all.append(piece, static_cast<std::size_t>(n));
        return all;
    }
    /// Waits for exactly `count` bytes; returns fewer when the peer has closed the connection.
    std::string receive(std::size_t count) const
    {
        std::string all(count, '\0');
        const ssize_t n = ::recv(_descriptor, all.data(), count, MSG_WAITALL);
        all.resize(n > 0 ? static_cast<std::size_t>(n) : 0);
        return all;
    }
    /// Whether the peer has closed the connection.
    bool isAbandoned() const
    {
        pollfd state{_descriptor, POLLIN | POLLRDHUP, 0};
        return ::poll(&state, 1, 0) > 0 && (state.revents & (POLLHUP | POLLRDHUP | POLLERR)) != 0;
    }
    void close()
    {
        if (_descriptor >= 0)
            ::close(std::exchange(_descriptor, -1));
    }

private:
    static sockaddr_un at(const std::string& path)
    {
        sockaddr_un address{};
        address.sun_family = AF_UNIX;
        std::strncpy(address.sun_path, path.c_str(), sizeof address.sun_path - 1);
        return address;
    }

    int _descriptor;
};

/// A frame byte by byte: length, kind, message id, serial, payload; numbers little-endian.
inline std::string frame(char kind, std::int32_t messageId, std::uint32_t serial, std::string_view payload)
{
    std::string bytes;
    const auto number = [&](std::uint32_t value) {
        for (int i = 0; i < 4; ++i, value >>= 8)
            bytes.push_back(static_cast<char>(value & 0xFF));
    };
    number(static_cast<std::uint32_t>(9 + payload.size()));
    bytes.push_back(kind);
    number(static_cast<std::uint32_t>(messageId));
    number(serial);
    return bytes.append(payload);
}

inline constexpr char kMessage = 1, kRequest = 2, kReply = 3;

} // namespace kestrum
