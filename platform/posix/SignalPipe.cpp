#include "platform/posix/SignalPipe.h"

#include <cerrno>
#include <cstddef>
#include <system_error>
#include <utility>

#include <fcntl.h>
#include <unistd.h>

namespace kestrum {
namespace {

int ends[2] = {-1, -1};
volatile std::sig_atomic_t arrived[NSIG];

void note(int signal)
{
    const int before = errno;
    arrived[signal] = 1;
    // A full pipe needs no further byte to wake the reader.
    [[maybe_unused]] const auto written = ::write(ends[1], "", 1);
    errno = before;
}

} // namespace

SignalPipe::SignalPipe(std::vector<int> numbers) : _signals(std::move(numbers)), _before(_signals.size())
{
    if (::pipe2(ends, O_CLOEXEC | O_NONBLOCK) != 0)
        throw std::system_error(errno, std::generic_category(), "cannot create a pipe for signals");
    struct sigaction action {};
    action.sa_handler = note;
    action.sa_flags = SA_RESTART;
    for (std::size_t i = 0; i < _signals.size(); ++i) {
        arrived[_signals[i]] = 0;
        ::sigaction(_signals[i], &action, &_before[i]);
    }
}

SignalPipe::~SignalPipe()
{
    for (std::size_t i = 0; i < _signals.size(); ++i)
        ::sigaction(_signals[i], &_before[i], nullptr);
    for (int& end : ends)
        ::close(std::exchange(end, -1));
}

int SignalPipe::descriptor() const
{
    return ends[0];
}

std::vector<int> SignalPipe::taken()
{
    char bytes[64];
    while (::read(ends[0], bytes, sizeof bytes) > 0) {
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
