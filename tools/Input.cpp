#include "tools/Input.h"

#include <cerrno>
#include <csignal>
#include <fcntl.h>
#include <poll.h>
#include <stdexcept>
#include <sys/inotify.h>
#include <sys/signalfd.h>
#include <sys/stat.h>
#include <system_error>
#include <unistd.h>

namespace kestrum {
namespace {

[[noreturn]] void fail(const std::string& what)
{
    throw std::system_error(errno, std::generic_category(), what);
}

} // namespace

Input::Input(const std::string& path, bool follow)
    : _file(path == "-" ? ::dup(STDIN_FILENO) : ::open(path.c_str(), O_RDONLY | O_CLOEXEC))
{
    if (_file < 0)
        fail("cannot be opened");
    // A pipe ends when its writer does.
    if (!follow || !size() || path == "-")
        return;
    // Watched before the first byte is read, so that no change falls between.
    _changes = ::inotify_init1(IN_CLOEXEC | IN_NONBLOCK);
    if (_changes < 0 || ::inotify_add_watch(_changes, path.c_str(), IN_MODIFY) < 0)
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
        const auto got = ::read(_file, into.data(), into.size());
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
    if (size().value_or(_read) < _read)
        throw std::runtime_error("has become shorter than what was read of it");
    return Woken::Changed;
}

} // namespace kestrum
