#include "platform/qt/TerminationSignals.h"

#include <QSocketNotifier>

#include <array>
#include <cerrno>
#include <csignal>

#include <fcntl.h>
#include <unistd.h>

namespace kestrum {
namespace {

constexpr std::array kSignals = {SIGTERM, SIGINT, SIGHUP};

// The end of the pipe to which the handler writes; -1: nobody watches.
volatile std::sig_atomic_t writeEnd = -1;

void onSignal(int)
{
    const int error = errno;
    const char byte = 0;
    // A full pipe has the loop's attention already.
    [[maybe_unused]] const auto written = ::write(static_cast<int>(writeEnd), &byte, 1);
    errno = error;
}

std::array<int, 2> makePipe()
{
    std::array<int, 2> ends{-1, -1};
    if (::pipe2(ends.data(), O_NONBLOCK | O_CLOEXEC) != 0)
        ends = {-1, -1};
    return ends;
}

} // namespace

struct TerminationSignals::Watch {
    explicit Watch(std::function<void()> run)
        : action(std::move(run)), pipe(makePipe()), notifier(pipe[0], QSocketNotifier::Read)
    {
        writeEnd = pipe[1];
        struct sigaction handler {};
        handler.sa_handler = onSignal;
        handler.sa_flags = SA_RESTART;
        for (std::size_t i = 0; i < kSignals.size(); ++i)
            ::sigaction(kSignals[i], &handler, &before[i]);
        QObject::connect(&notifier, &QSocketNotifier::activated, &notifier, [this] {
            std::array<char, 64> bytes;
            while (::read(pipe[0], bytes.data(), bytes.size()) > 0)
                continue;
            action();
        });
    }
    Watch(const Watch&) = delete;
    Watch& operator=(const Watch&) = delete;
    ~Watch()
    {
        for (std::size_t i = 0; i < kSignals.size(); ++i)
            ::sigaction(kSignals[i], &before[i], nullptr);
        writeEnd = -1;
        notifier.setEnabled(false);
        for (const int end : pipe)
            ::close(end);
    }

    std::function<void()> action;
    std::array<int, 2> pipe;
    QSocketNotifier notifier;
    std::array<struct sigaction, kSignals.size()> before{};
};

TerminationSignals::TerminationSignals(std::function<void()> action)
    : _watch(std::make_unique<Watch>(std::move(action)))
{}

TerminationSignals::~TerminationSignals() = default;

} // namespace kestrum
