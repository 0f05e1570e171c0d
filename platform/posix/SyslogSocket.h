#pragma once

#include <chrono>
#include <functional>
#include <string>

namespace kestrum {

/// The socket of the system's log daemon. Unlike syslog(3) it tells that a line is lost, and does not open a socket for
/// each line while no daemon listens.
class SyslogSocket {
public:
    using Now = std::function<std::chrono::steady_clock::time_point()>;
    /// The pause after a failure. Lines in between are lost.
    static constexpr std::chrono::seconds kPause{5};

    /// `program` is the name in the log; `path` is the daemon's datagram socket.
    explicit SyslogSocket(std::string program, std::string path = "/dev/log", Now now = std::chrono::steady_clock::now);
    SyslogSocket(const SyslogSocket&) = delete;
    SyslogSocket& operator=(const SyslogSocket&) = delete;
    ~SyslogSocket();

    /// False when the line is lost. Blocks while the daemon does not read.
    bool write(int level, const std::string& text);

private:
    bool connect();
    bool send(const std::string& line) const;
    void close();

    std::string _program, _path;
    Now _now;
    int _descriptor = -1;
    std::chrono::steady_clock::time_point _resume; // no attempt before it
};

} // namespace kestrum
