#include "tools/Input.h"

#include <cerrno>
#include <csignal>
#include <fcntl.h>
#include <poll.h>
#include <sys/inotify.h>
#include <sys/signalfd.h>
#include <sys/stat.h>
#include <system_error>
#include <unistd.h>
#include <utility>

namespace kestrum::tools {
namespace {

[[noreturn]] void fail(const std::string& what)
{
    throw std::system_error(errno, std::generic_category(), what);
}

} // namespace

Input::Input(const std::string& path, bool follow)
    : _path(path), _file(path == "-" ? ::dup(STDIN_FILENO) : ::open(path.c_str(), O_RDONLY | O_CLOEXEC))
{
    if (_file < 0)
        fail("cannot be opened");
    _isSeekable = path != "-" && size();
    // A pipe is not watched: it ends when its writer closes it.
    if (!follow || !size() || path == "-")
        return;
    // The watch starts before the first read, so that no change is missed.
    _changes = ::inotify_init1(IN_CLOEXEC | IN_NONBLOCK);
    if (_changes < 0)
        fail("cannot be followed");
    watch();
    // The folder is watched too, because another file may get the name.
    const auto slash = path.rfind('/');
    const auto directory = slash == path.npos ? "." : path.substr(0, slash + 1);
    if (::inotify_add_watch(_changes, directory.c_str(), IN_CREATE | IN_MOVED_TO | IN_DELETE | IN_MOVED_FROM) < 0)
        fail("cannot be followed");
    sigset_t endings;
    sigemptyset(&endings);
    for (const int each : {SIGINT, SIGTERM, SIGHUP})
        sigaddset(&endings, each);
    ::sigprocmask(SIG_BLOCK, &endings, nullptr);
    _signals = ::signalfd(-1, &endings, SFD_CLOEXEC);
    if (_signals < 0)
        fail("cannot be followed");
}

Input::~Input()
{
    for (const int each : {_file, _changes, _signals})
        if (each >= 0)
            ::close(each);
}

std::size_t Input::read(std::span<std::byte> into)
{
    for (;;) {
        // At its own position: forked processes share that of the file.
        const auto got = _isSeekable ? ::pread(_file, into.data(), into.size(), static_cast<::off_t>(_read))
                                     : ::read(_file, into.data(), into.size());
        if (got >= 0) {
            _read += static_cast<std::size_t>(got);
            return static_cast<std::size_t>(got);
        }
        if (errno != EINTR)
            fail("cannot be read");
    }
}

std::optional<std::uint64_t> Input::size() const
{
    struct stat status {};
    if (::fstat(_file, &status) != 0 || !S_ISREG(status.st_mode))
        return std::nullopt;
    return static_cast<std::uint64_t>(status.st_size);
}

Input::Woken Input::wait(std::optional<std::chrono::milliseconds> atMost)
{
    pollfd both[] = {{_signals, POLLIN, 0}, {_changes, POLLIN, 0}};
    const int ready = ::poll(both, std::size(both), atMost ? static_cast<int>(atMost->count()) : -1);
    if (ready < 0 && errno != EINTR)
        fail("cannot be followed");
    if (both[0].revents != 0)
        return Woken::Ended;
    if (both[1].revents == 0)
        return Woken::TimedOut;
    alignas(inotify_event) char events[4096];
    while (::read(_changes, events, sizeof events) > 0) {
    }
    return whatChanged();
}

void Input::watch()
{
    if (::inotify_add_watch(_changes, ("/proc/self/fd/" + std::to_string(_file)).c_str(), IN_MODIFY) < 0)
        fail("cannot be followed");
}

Input::Woken Input::whatChanged()
{
    const auto there = size().value_or(_read);
    if (there > _read)
        return Woken::Changed;
    if (there < _read) {
        _read = 0;
        return Woken::Restarted;
    }
    struct stat held {
    }, named{};
    ::fstat(_file, &held);
    if (::stat(_path.c_str(), &named) != 0)
        return std::exchange(_isGone, true) ? Woken::TimedOut : Woken::Gone;
    if (held.st_dev == named.st_dev && held.st_ino == named.st_ino)
        return Woken::TimedOut;
    const int another = ::open(_path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK);
    if (another < 0)
        fail("cannot be opened");
    ::close(std::exchange(_file, another));
    _read = 0;
    _isGone = false;
    watch();
    return Woken::Restarted;
}

} // namespace kestrum::tools
