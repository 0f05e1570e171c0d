#include "frontends/terminal/Signals.h"

#include <cerrno>
#include <cstddef>
#include <fcntl.h>
#include <system_error>
#include <unistd.h>
#include <utility>

namespace kestrum {

namespace {

int wakeUp[2] = {-1, -1};
volatile std::sig_atomic_t arrived[NSIG];

void note(int signal)
{
    const int before = errno;
    arrived[signal] = 1;
    // A full pipe wakes up just as well.
    [[maybe_unused]] const auto written = write(wakeUp[1], "", 1);
    errno = before;
}

} // namespace

Signals::Signals(std::vector<int> signals) : _signals(std::move(signals)), _before(_signals.size())
{
    if (pipe2(wakeUp, O_CLOEXEC | O_NONBLOCK) != 0)
        throw std::system_error(errno, std::generic_category(), "pipe");
    struct sigaction action {};
    action.sa_handler = note;
    action.sa_flags = SA_RESTART;
    for (std::size_t i = 0; i < _signals.size(); ++i)
        sigaction(_signals[i], &action, &_before[i]);
}

Signals::~Signals()
{
    for (std::size_t i = 0; i < _signals.size(); ++i)
        sigaction(_signals[i], &_before[i], nullptr);
    close(wakeUp[0]);
    close(wakeUp[1]);
}

int Signals::descriptor() const
{
    return wakeUp[0];
}

std::vector<int> Signals::taken()
{
    char bytes[64];
    while (read(wakeUp[0], bytes, sizeof bytes) > 0) {
    }
    std::vector<int> signals;
    for (const int each : _signals)
        if (arrived[each]) {
            arrived[each] = 0;
            signals.push_back(each);
        }
    return signals;
}

} // namespace kestrum
