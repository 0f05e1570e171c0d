#pragma once

#include "platform/posix/Frame.h"
#include "support/Problem.h"

#include <QLocalServer>
#include <QLocalSocket>

#include <chrono>
#include <functional>
#include <memory>
#include <optional>
#include <string>

namespace kestrum {

class SystemLog;

/// One end of a connection that carries frames. Its handlers may destroy it. The log is borrowed.
class FrameConnection {
public:
    /// Connects to the socket at `path`; null when no process of this user listens there.
    static std::unique_ptr<FrameConnection> connectTo(const std::string& path, std::chrono::milliseconds timeout,
                                                      SystemLog& log);
    /// Takes a connected socket. Null, with a log line, when the peer is another user's process.
    static std::unique_ptr<FrameConnection> ofThisUser(std::unique_ptr<QLocalSocket> socket, const std::string& path,
                                                       SystemLog& log);
    FrameConnection(std::unique_ptr<QLocalSocket> socket, std::string name, SystemLog& log);
    ~FrameConnection();

    bool isOpen() const { return _socket->state() == QLocalSocket::ConnectedState; }
    /// Closes at once; unsent and unread bytes are lost. Does not run `closed`.
    void close();

    /// The next received frame, also after the peer has closed. Its payload is valid until the next call. A malformed
    /// frame is logged, closes the connection and runs `closed`.
    std::optional<Frame> next();

    /// Sends a frame. The socket buffers the bytes that the system does not take at once. False when closed.
    bool send(const Frame& frame);
    /// The number of buffered bytes.
    std::size_t unsent() const { return static_cast<std::size_t>(_socket->bytesToWrite()); }
    /// Writes buffered bytes to the system now instead of from the event loop. Runs no handler.
    void push();
    /// The socket's file descriptor, for operations on the socket itself.
    int descriptor() const { return static_cast<int>(_socket->socketDescriptor()); }

    /// Waits until all bytes are sent; false after `timeout` or when the connection closed. Serves nothing else and
    /// runs no handler: call `isOpen` and `next` afterwards.
    bool waitUntilSent(std::chrono::milliseconds timeout);

    // Run from the event loop: bytes were received; the peer has closed; buffered bytes were sent.
    std::function<void()> readable, closed, written;

private:
    void run(const std::function<void()>& handler);

    std::unique_ptr<QLocalSocket> _socket;
    std::string _name;
    SystemLog& _log;
    FrameReader _reader;
    std::vector<std::byte> _outgoing; // a member so that its memory is reused
    std::shared_ptr<int> _running = std::make_shared<int>(0);
    bool _waiting = false;
};

/// Connects without blocking. While the listener's backlog is full, it tries again until `timeout`.
class FrameConnectionAttempt {
public:
    using Done = std::function<void(std::unique_ptr<FrameConnection>)>;

    /// `done` runs once, from the event loop: with the connection, or with null when no process of this user listens
    /// at the path. It may destroy the attempt. Destroying the attempt cancels it.
    FrameConnectionAttempt(std::string path, std::chrono::milliseconds timeout, SystemLog& log, Done done);

private:
    void attempt();

    std::string _path;
    std::chrono::steady_clock::time_point _end;
    SystemLog& _log;
    Done _done;
    QObject _context; // its end cancels the retries
};

/// Listens for connections of this user's processes.
class FrameListener {
public:
    explicit FrameListener(SystemLog& log) : _log(log) {}

    /// Listens at the path. Removes the socket of a process that has ended, never that of a running one. Waits up to
    /// 1 s for the directory's lock.
    std::optional<Problem> listen(const std::string& path);
    /// Stops listening and removes the socket.
    void close() { _server.close(); }

    /// Called with each new connection. Must not destroy the listener.
    std::function<void(std::unique_ptr<FrameConnection>)> accepted;

private:
    void accept();

    SystemLog& _log;
    QLocalServer _server;
    std::string _name;
};

/// Removes the sockets in a directory whose names begin with `prefix` and whose processes have ended. Does nothing
/// while another process holds the directory's lock.
void removeStaleSockets(const std::string& directory, std::string_view prefix);

} // namespace kestrum
