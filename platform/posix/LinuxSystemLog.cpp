#include "platform/posix/LinuxSystemLog.h"

#include "platform/posix/SyslogSocket.h"
#include "support/Format.h"
#include "support/Utf8.h"

#include <algorithm>
#include <array>
#include <chrono>
#include <condition_variable>
#include <cstdio>
#include <cstdlib>
#include <deque>
#include <mutex>
#include <thread>
#include <utility>

namespace kestrum {
namespace {

// syslog would take 16 for an emergency of the mail facility, which the daemon prints on every terminal.
int levelOf(Priority priority)
{
    return priority == Priority::Raw16 ? LOG_NOTICE : static_cast<int>(priority);
}

std::string lineOf(std::string_view text)
{
    constexpr std::string_view kEllipsis = "\u2026";
    if (text.size() <= LinuxSystemLog::kLongestLine)
        return std::string(text);
    return std::string(beginOf(text, LinuxSystemLog::kLongestLine - kEllipsis.size())).append(kEllipsis);
}

struct Line {
    std::size_t number;
    int level;
    std::string text;
};

/// Lines that wait for the thread.
struct Queue {
    std::deque<Line> errors, others; // each in the order written

    bool isEmpty() const { return errors.empty() && others.empty(); }
    std::size_t size() const { return errors.size() + others.size(); }
    Line next()
    {
        auto& from =
            others.empty() || (!errors.empty() && errors.front().number < others.front().number) ? errors : others;
        auto line = std::move(from.front());
        from.pop_front();
        return line;
    }
};

} // namespace

// Shared with the thread: it outlives the log when the thread hangs in its sink at the end.
struct LinuxSystemLog::Shared {
    Sink sink;
    std::size_t capacity;
    std::mutex mutex;
    std::condition_variable changed;
    Queue waiting;
    std::size_t written = 0;
    std::size_t lost = 0; // since the last report
    bool ending = false, ended = false;

    void add(int level, std::string_view text)
    {
        if (waiting.size() >= capacity) {
            ++lost;
            // A line of error priority replaces an ordinary one.
            if (level > LOG_ERR || waiting.others.empty())
                return;
            waiting.others.pop_front();
        }
        (level > LOG_ERR ? waiting.others : waiting.errors).push_back({written++, level, lineOf(text)});
    }

    void run()
    {
        std::unique_lock lock(mutex);
        for (;;) {
            changed.wait(lock, [&] { return !waiting.isEmpty() || ending; });
            if (waiting.isEmpty())
                break;
            auto taken = std::exchange(waiting, {});
            auto missing = std::exchange(lost, 0);
            lock.unlock();
            while (!taken.isEmpty())
                if (const auto line = taken.next(); !sink(line.level, line.text))
                    ++missing;
            if (missing > 0 && sink(LOG_WARNING, formatted("%lu log lines were lost", missing)))
                missing = 0;
            lock.lock();
            lost += missing;
        }
        ended = true;
        changed.notify_all();
    }
};

LinuxSystemLog::LinuxSystemLog(const std::string& program)
    : LinuxSystemLog([socket = std::make_shared<SyslogSocket>(program)](
                         int level, const std::string& text) { return socket->write(level, text); },
                     logLevel(program, LOG_ERR))
{}

LinuxSystemLog::LinuxSystemLog(Sink sink, int level, std::size_t capacity)
    : _shared(std::make_shared<Shared>()), _level(level)
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
    if (!passes(priority))
        return;
    {
        const std::lock_guard lock(_shared->mutex);
        _shared->add(levelOf(priority), text);
    }
    _shared->changed.notify_one();
}

bool LinuxSystemLog::passes(Priority priority) const
{
    return levelOf(priority) <= _level;
}

int logLevel(const std::string& program, int unset)
{
    const char* const named = std::getenv("KESTRUM_LOG");
    if (named == nullptr || *named == '\0')
        return unset;
    constexpr std::array<std::string_view, 4> kNames{"error", "warning", "notice", "info"}; // from LOG_ERR on
    if (const auto found = std::ranges::find(kNames, named); found != kNames.end())
        return LOG_ERR + static_cast<int>(found - kNames.begin());
    standardErrorSink(program)(LOG_ERR, formatted("KESTRUM_LOG=%s is none of error, warning, notice, info", named));
    return unset;
}

LinuxSystemLog::Sink standardErrorSink(const std::string& program)
{
    return [program](int, const std::string& text) {
        const std::string line = program + ": " + text + "\n";
        return std::fwrite(line.data(), 1, line.size(), stderr) == line.size();
    };
}

} // namespace kestrum
