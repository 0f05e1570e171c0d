#include "frontends/qt/TerminationSignals.h"

#include <cerrno>
#include <fcntl.h>
#include <sys/socket.h>
#include <system_error>
#include <unistd.h>

namespace kestrum::qt {

namespace {

// A signal handler may do little more than write: one end for it, the other for the main loop.
int ends[2] = {-1, -1};

void arrived(int)
{
    const int error = errno;
    const char byte = 0;
    // When the socket is full, a byte waits there already.
    [[maybe_unused]] const auto written = write(ends[0], &byte, sizeof byte);
    errno = error;
}

} // namespace

TerminationSignals::TerminationSignals(std::function<void()> ended)
{
    if (socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0, ends) != 0)
        throw std::system_error(errno, std::generic_category(), "socketpair");
    _notifier = std::make_unique<QSocketNotifier>(ends[1], QSocketNotifier::Read);
    QObject::connect(_notifier.get(), &QSocketNotifier::activated, [ended = std::move(ended)] {
        char bytes[16];
        while (read(ends[1], bytes, sizeof bytes) > 0)
            ;
        ended();
    });
    struct sigaction action {};
    action.sa_handler = arrived;
    action.sa_flags = SA_RESTART;
    sigemptyset(&action.sa_mask);
    for (std::size_t i = 0; i < std::size(kSignals); ++i)
        sigaction(kSignals[i], &action, &_before[i]);
}

TerminationSignals::~TerminationSignals()
{
    for (std::size_t i = 0; i < std::size(kSignals); ++i)
        sigaction(kSignals[i], &_before[i], nullptr);
    _notifier.reset();
    for (int& end : ends)
        close(std::exchange(end, -1));
}

} // namespace kestrum::qt
