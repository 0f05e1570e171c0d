#include "platform/posix/LinuxSystemLog.h"

#include "support/Format.h"

#include <chrono>
#include <condition_variable>
#include <cstdio>
#include <deque>
#include <mutex>
#include <thread>
#include <utility>

#include <syslog.h>

namespace kestrum {
namespace {

// syslog(3) would take 16 for an emergency of the mail facility, which the daemon prints on every terminal.
int levelOf(Priority priority)
{
    return priority == Priority::Raw16 ? LOG_NOTICE : static_cast<int>(priority);
}

// Cuts between two UTF-8 characters.
std::string lineOf(std::string_view text)
{
    constexpr std::string_view kEllipsis = "\u2026";
    if (text.size() <= LinuxSystemLog::kLongestLine)
        return std::string(text);
    auto end = LinuxSystemLog::kLongestLine - kEllipsis.size();
    const auto continues = [&] { return (static_cast<unsigned char>(text[end]) & 0xC0) == 0x80; };
    for (int i = 0; i < 3 && continues(); ++i)
        --end;
    return std::string(text.substr(0, end)).append(kEllipsis);
}

} // namespace

// Shared with the thread: it outlives the log when the thread hangs in its sink at the end.
struct LinuxSystemLog::Shared {
    struct Line {
        std::size_t number;
        int level;
        std::string text;
    };

    Sink sink;
    std::size_t capacity;
    std::mutex mutex;
    std::condition_variable changed;
    std::deque<Line> errors, others; // each in the order written
    std::size_t written = 0;
    std::size_t lost = 0;
    bool ending = false, ended = false;

    void add(int level, std::string_view text)
    {
        if (errors.size() + others.size() >= capacity) {
            ++lost;
            // A line of error priority replaces an ordinary one.
            if (level > LOG_ERR || others.empty())
                return;
            others.pop_front();
        }
        (level > LOG_ERR ? others : errors).push_back({written++, level, lineOf(text)});
    }

    Line next()
    {
        auto& from =
            others.empty() || (!errors.empty() && errors.front().number < others.front().number) ? errors : others;
        auto line = std::move(from.front());
        from.pop_front();
        return line;
    }

    void run()
    {
        std::unique_lock lock(mutex);
        for (std::size_t sinceReport = 0;;) {
            changed.wait(lock, [&] { return !errors.empty() || !others.empty() || ending; });
            if (errors.empty() && others.empty())
                break;
            const auto line = next();
            // Not only when the queue is empty: during a long flood it never is.
            const bool report = lost > 0 && (++sinceReport >= capacity || (errors.empty() && others.empty()));
            const std::size_t count = report ? std::exchange(lost, 0) : 0;
            lock.unlock();
            sink(line.level, line.text);
            if (report) {
                sinceReport = 0;
                sink(LOG_WARNING, formatted("%lu log lines were lost", count));
            }
            lock.lock();
        }
        ended = true;
        changed.notify_all();
    }
};

LinuxSystemLog::LinuxSystemLog(const std::string& program)
    : LinuxSystemLog([](int level, const std::string& text) { ::syslog(level, "%s", text.c_str()); })
{
    // openlog(3) keeps the pointer until the program ends.
    static const std::string kept = program;
    ::openlog(kept.c_str(), LOG_PID, LOG_USER);
}

LinuxSystemLog::LinuxSystemLog(Sink sink, std::size_t capacity) : _shared(std::make_shared<Shared>())
{
    _shared->sink = std::move(sink);
    _shared->capacity = capacity;
    std::thread([shared = _shared] { shared->run(); }).detach();
}

LinuxSystemLog::~LinuxSystemLog()
{
    std::unique_lock lock(_shared->mutex);
    _shared->ending = true;
    _shared->changed.notify_all();
    _shared->changed.wait_for(lock, std::chrono::milliseconds(500), [&] { return _shared->ended; });
}

void LinuxSystemLog::write(Priority priority, std::string_view text)
{
    {
        const std::lock_guard lock(_shared->mutex);
        _shared->add(levelOf(priority), text);
    }
    _shared->changed.notify_one();
}

LinuxSystemLog::Sink standardErrorSink(const std::string& program)
{
    return [program](int, const std::string& text) {
        const std::string line = program + ": " + text + "\n";
        std::fwrite(line.data(), 1, line.size(), stderr);
    };
}

} // namespace kestrum
