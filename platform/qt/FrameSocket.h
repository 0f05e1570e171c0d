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

/// One end of a connection that carries frames. Its handlers may destroy it.
class FrameConnection {
public:
    /// Connects to the socket at `path`; null when nobody of this user listens there.
    static std::unique_ptr<FrameConnection> connectTo(const std::string& path, std::chrono::milliseconds timeout,
                                                      SystemLog& log);
    /// Of a connected socket; null, with a log line, when the other side is another user's process.
    static std::unique_ptr<FrameConnection> ofThisUser(std::unique_ptr<QLocalSocket> socket, const std::string& path,
                                                       SystemLog& log);
    FrameConnection(std::unique_ptr<QLocalSocket> socket, std::string name, SystemLog& log);
    ~FrameConnection();

    bool isOpen() const { return _socket->state() == QLocalSocket::ConnectedState; }
    /// Ends it at once; what was not sent or read is lost. `closed` is not run.
    void close();

    /// The next frame that has arrived, also after the other side has gone. Its payload is valid until the next call.
    /// A malformed one is logged, closes the connection and runs `closed`.
    std::optional<Frame> next();

    /// Hands a frame to the socket, which keeps what the system does not take at once. False when closed.
    bool send(const Frame& frame);
    /// The bytes that the socket keeps.
    std::size_t unsent() const { return static_cast<std::size_t>(_socket->bytesToWrite()); }
    /// Gives the system what it takes of them at once, rather than from the event loop. Runs no handler.
    void push();
    /// The system's socket, for what is no frame.
    int descriptor() const { return static_cast<int>(_socket->socketDescriptor()); }

    /// Waits until nothing is kept; false when time is up or the connection closed. Serves nothing else and runs no
    /// handler: look at `isOpen` and `next` afterwards.
    bool waitUntilSent(std::chrono::milliseconds timeout);

    // From the event loop: bytes have come; the other side has gone; some kept bytes went.
    std::function<void()> readable, closed, written;

private:
    void run(const std::function<void()>& handler);

    std::unique_ptr<QLocalSocket> _socket;
    std::string _name;
    SystemLog& _log;
    FrameReader _reader;
    std::vector<std::byte> _outgoing; // kept for its storage
    std::shared_ptr<int> _running = std::make_shared<int>(0);
    bool _waiting = false;
};

/// Connects without blocking. A listener whose backlog is full is tried again until the time is up.
class FrameConnectionAttempt {
public:
    using Done = std::function<void(std::unique_ptr<FrameConnection>)>;

    /// `done` runs once, from the event loop: with the connection, or with null when no process of this user listens
    /// at the path. It may destroy the attempt, which cancels it.
    FrameConnectionAttempt(std::string path, std::chrono::milliseconds timeout, SystemLog& log, Done done);

private:
    void attempt();

    std::string _path;
    std::chrono::steady_clock::time_point _end;
    SystemLog& _log;
    Done _done;
    QObject _context; // ends the retries with the attempt
};

/// Listens for connections of this user's processes.
class FrameListener {
public:
    explicit FrameListener(SystemLog& log) : _log(log) {}

    /// Listens at the path, from which it removes the socket of a process that has ended; that of a running process
    /// is left alone. Waits up to 1 s for the directory's lock.
    std::optional<Problem> listen(const std::string& path);
    /// Stops, and removes the socket.
    void close() { _server.close(); }

    /// Takes each new connection. Must not destroy the listener.
    std::function<void(std::unique_ptr<FrameConnection>)> accepted;

private:
    void accept();

    SystemLog& _log;
    QLocalServer _server;
    std::string _name;
};

/// Removes the sockets in a directory whose names begin so and whose processes have gone. Does nothing while another
/// process keeps the directory locked.
void removeStaleSockets(const std::string& directory, std::string_view prefix);

} // namespace kestrum
