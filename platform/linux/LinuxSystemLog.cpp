#include "platform/linux/LinuxSystemLog.h"

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

// 16 would be an emergency of the mail facility, which the daemon shouts at every terminal.
int levelOf(Priority priority)
{
    return priority == Priority::Raw16 ? LOG_NOTICE : static_cast<int>(priority);
}

} // namespace

// Outlives the log when the thread hangs in its sink at the end.
struct LinuxSystemLog::Shared {
    Sink sink;
    std::size_t capacity;
    std::mutex mutex;
    std::condition_variable changed;
    std::deque<std::pair<int, std::string>> lines;
    std::size_t lost = 0;
    bool ending = false, ended = false;

    void run()
    {
        std::unique_lock lock(mutex);
        for (;;) {
            changed.wait(lock, [&] { return !lines.empty() || ending; });
            if (lines.empty())
                break;
            const auto line = std::move(lines.front());
            lines.pop_front();
            lock.unlock();
            sink(line.first, line.second);
            lock.lock();
            if (lines.empty() && lost > 0)
                lines.emplace_back(LOG_WARNING, formatted("%lu log lines were lost", std::exchange(lost, 0)));
        }
        ended = true;
        changed.notify_all();
    }
};

LinuxSystemLog::LinuxSystemLog(const std::string& program)
    : LinuxSystemLog([](int level, const std::string& text) { ::syslog(level, "%s", text.c_str()); })
{
    // syslog keeps the pointer for as long as the program runs.
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
        if (_shared->lines.size() >= _shared->capacity) {
            ++_shared->lost;
            return;
        }
        _shared->lines.emplace_back(levelOf(priority), text);
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
