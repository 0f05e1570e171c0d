#include "platform/qt/FrameSocket.h"

#include "platform/SystemLog.h"
#include "support/Format.h"
#include "support/ScopedFlag.h"

#include <QTimer>

#include <cerrno>
#include <cstring>
#include <filesystem>
#include <thread>

#include <fcntl.h>
#include <sys/file.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

namespace kestrum {
namespace {

using namespace std::chrono;

constexpr milliseconds kLockTimeout{1000}, kLockInterval{10};
// The pause before the next try when the listener's backlog is full.
constexpr milliseconds kRetryInterval{20};
constexpr std::size_t kChunk = 64 << 10;
// Bytes that Qt reads ahead while the receiver is busy; the rest stays with the sender.
constexpr qint64 kReadAhead = 256 << 10;

struct Peer {
    unsigned user;
    int process;
};

std::optional<Peer> peerOf(const QLocalSocket& socket)
{
    ucred found{};
    socklen_t size = sizeof found;
    if (::getsockopt(static_cast<int>(socket.socketDescriptor()), SOL_SOCKET, SO_PEERCRED, &found, &size) != 0)
        return std::nullopt;
    return Peer{found.uid, found.pid};
}

bool isThisUser(const QLocalSocket& socket, const std::string& name, SystemLog& log)
{
    const auto peer = peerOf(socket);
    if (peer && peer->user == ::geteuid())
        return true;
    log.write(Priority::Error, "Port %s: refused process %d of user %u", name, peer ? peer->process : 0,
              peer ? peer->user : ~0u);
    return false;
}

std::string nameAt(const std::string& path)
{
    return std::filesystem::path(path).filename().string();
}

bool isStaleSocket(const std::string& path)
{
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    if (path.size() >= sizeof address.sun_path)
        return false;
    std::memcpy(address.sun_path, path.data(), path.size());
    const int probe = ::socket(AF_UNIX, SOCK_STREAM | SOCK_NONBLOCK | SOCK_CLOEXEC, 0);
    const bool refused =
        ::connect(probe, reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0 && errno == ECONNREFUSED;
    ::close(probe);
    return refused;
}

// The lock of a directory. It prevents two processes from removing and binding the same address at the same time.
class DirectoryLock {
public:
    // Any process of the user may hold the lock, so the wait is bounded.
    DirectoryLock(const std::string& directory, milliseconds patience)
        : _descriptor(::open(directory.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC))
    {
        for (const auto end = steady_clock::now() + patience; _descriptor >= 0;) {
            _held = ::flock(_descriptor, LOCK_EX | LOCK_NB) == 0;
            if (_held || steady_clock::now() >= end)
                break;
            std::this_thread::sleep_for(kLockInterval);
        }
    }
    DirectoryLock(const DirectoryLock&) = delete;
    DirectoryLock& operator=(const DirectoryLock&) = delete;
    ~DirectoryLock()
    {
        if (_descriptor >= 0)
            ::close(_descriptor);
    }

    bool isHeld() const { return _held; }

private:
    int _descriptor;
    bool _held = false;
};

} // namespace

std::unique_ptr<FrameConnection> FrameConnection::connectTo(const std::string& path, milliseconds timeout,
                                                            SystemLog& log)
{
    auto socket = std::make_unique<QLocalSocket>();
    socket->connectToServer(QString::fromStdString(path));
    if (!socket->waitForConnected(static_cast<int>(timeout.count())))
        return nullptr;
    return ofThisUser(std::move(socket), path, log);
}

std::unique_ptr<FrameConnection> FrameConnection::ofThisUser(std::unique_ptr<QLocalSocket> socket,
                                                             const std::string& path, SystemLog& log)
{
    auto name = nameAt(path);
    if (!isThisUser(*socket, name, log))
        return nullptr;
    return std::make_unique<FrameConnection>(std::move(socket), std::move(name), log);
}

FrameConnectionAttempt::FrameConnectionAttempt(std::string path, milliseconds timeout, SystemLog& log, Done done)
    : _path(std::move(path)), _end(steady_clock::now() + timeout), _log(log), _done(std::move(done))
{
    QTimer::singleShot(0, &_context, [this] { attempt(); });
}

void FrameConnectionAttempt::attempt()
{
    // A Unix socket connects at once or fails at once. When the listener's backlog is full, Qt would try again without
    // a pause.
    auto socket = std::make_unique<QLocalSocket>();
    socket->connectToServer(QString::fromStdString(_path));
    if (socket->state() == QLocalSocket::ConnectingState && steady_clock::now() < _end) {
        QTimer::singleShot(kRetryInterval, &_context, [this] { attempt(); });
        return;
    }
    const auto done = std::move(_done); // moved out: it may destroy this object
    done(socket->state() == QLocalSocket::ConnectedState ? FrameConnection::ofThisUser(std::move(socket), _path, _log)
                                                         : nullptr);
}

FrameConnection::FrameConnection(std::unique_ptr<QLocalSocket> socket, std::string name, SystemLog& log)
    : _socket(std::move(socket)), _name(std::move(name)), _log(log)
{
    _socket->setReadBufferSize(kReadAhead);
    QObject::connect(_socket.get(), &QLocalSocket::readyRead, _socket.get(), [this] { run(readable); });
    QObject::connect(_socket.get(), &QLocalSocket::disconnected, _socket.get(), [this] { run(closed); });
    QObject::connect(_socket.get(), &QLocalSocket::bytesWritten, _socket.get(), [this] { run(written); });
}

FrameConnection::~FrameConnection()
{
    close();
    // A QObject must not be deleted inside one of its signals.
    if (*_running > 0)
        _socket.release()->deleteLater();
}

void FrameConnection::run(const std::function<void()>& handler)
{
    if (_waiting || !handler)
        return;
    // Copies: the handler may destroy this object and so itself.
    const auto running = _running;
    const auto copy = handler;
    ++*running;
    copy();
    --*running;
}

void FrameConnection::close()
{
    _socket->disconnect();
    _socket->abort();
}

std::optional<Frame> FrameConnection::next()
{
    for (;;) {
        if (auto frame = _reader.next())
            return frame;
        if (!_reader.fault().empty()) {
            if (isOpen()) {
                const auto peer = peerOf(*_socket);
                _log.write(Priority::Error, "Port %s: closed the connection of process %d: %s", _name,
                           peer ? peer->process : 0, _reader.fault());
                close();
                run(closed);
            }
            return std::nullopt;
        }
        const auto room = _reader.room(kChunk);
        const qint64 count = _socket->read(reinterpret_cast<char*>(room.data()), static_cast<qint64>(room.size()));
        if (count <= 0)
            return std::nullopt;
        _reader.filled(static_cast<std::size_t>(count));
    }
}

bool FrameConnection::send(const Frame& frame)
{
    if (!isOpen())
        return false;
    _outgoing.clear();
    appendFrame(_outgoing, frame);
    const auto size = static_cast<qint64>(_outgoing.size());
    return _socket->write(reinterpret_cast<const char*>(_outgoing.data()), size) == size;
}

void FrameConnection::push()
{
    const ScopedFlag waiting(_waiting);
    _socket->flush();
}

bool FrameConnection::waitUntilSent(milliseconds timeout)
{
    const auto end = steady_clock::now() + timeout;
    const ScopedFlag waiting(_waiting);
    _socket->flush();
    while (unsent() > 0) {
        const auto left = ceil<milliseconds>(end - steady_clock::now());
        if (left.count() <= 0 || !_socket->waitForBytesWritten(static_cast<int>(left.count())))
            return false;
    }
    return isOpen();
}

std::optional<Problem> FrameListener::listen(const std::string& path)
{
    if (path.size() >= sizeof sockaddr_un::sun_path)
        return Problem{formatted("the path %s is too long for a socket (%lu bytes at most)", path,
                                 sizeof sockaddr_un::sun_path - 1)};
    _name = nameAt(path);
    const auto directory = std::filesystem::path(path).parent_path().string();
    const DirectoryLock lock(directory, kLockTimeout);
    if (!lock.isHeld())
        return Problem{formatted("another process holds the lock of %s", directory)};
    if (isStaleSocket(path))
        ::unlink(path.c_str());
    QObject::connect(&_server, &QLocalServer::newConnection, &_server, [this] { accept(); });
    if (_server.listen(QString::fromStdString(path)))
        return std::nullopt;
    if (_server.serverError() == QAbstractSocket::AddressInUseError)
        return Problem{formatted("another process listens at %s", path)};
    return Problem{formatted("cannot listen at %s: %s", path, _server.errorString().toStdString())};
}

void FrameListener::accept()
{
    std::unique_ptr<QLocalSocket> socket(_server.nextPendingConnection());
    if (!socket)
        return;
    socket->setParent(nullptr); // owned here, no longer by the server
    if (accepted && isThisUser(*socket, _name, _log))
        accepted(std::make_unique<FrameConnection>(std::move(socket), _name, _log));
}

void removeStaleSockets(const std::string& directory, std::string_view prefix)
{
    const DirectoryLock lock(directory, milliseconds(0));
    if (!lock.isHeld())
        return;
    std::error_code error;
    for (const auto& entry : std::filesystem::directory_iterator(directory, error))
        if (entry.path().filename().string().starts_with(prefix) && isStaleSocket(entry.path().string()))
            ::unlink(entry.path().c_str());
}

} // namespace kestrum
