#include "harness/Scratch.h"
#include "platform/posix/LinuxSystemLog.h"
#include "platform/posix/SyslogSocket.h"
#include "support/Format.h"

#include <gmock/gmock.h>

#include <condition_variable>
#include <mutex>

#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

namespace kestrum {
namespace {

using namespace std::chrono;
using namespace std::chrono_literals;
using testing::ElementsAre;

/// A sink that blocks until the test releases it.
struct StuckSink {
    bool operator()(int level, const std::string& text)
    {
        std::unique_lock lock(state->mutex);
        state->lines.emplace_back(level, text);
        state->changed.notify_all();
        state->changed.wait(lock, [&] { return state->open || state->lines.size() <= state->released; });
        return !state->losing;
    }
    struct State {
        std::mutex mutex;
        std::condition_variable changed;
        bool open = false, losing = false;
        std::size_t released = 0;
        std::vector<std::pair<int, std::string>> lines;
    };
    std::shared_ptr<State> state = std::make_shared<State>();

    void open() const
    {
        const std::lock_guard lock(state->mutex);
        state->open = true;
        state->changed.notify_all();
    }
    /// Releases the first `count` lines.
    void release(std::size_t count) const
    {
        const std::lock_guard lock(state->mutex);
        state->released = count;
        state->changed.notify_all();
    }
    /// From now on each line is lost, or none is.
    void setLosing(bool losing) const
    {
        const std::lock_guard lock(state->mutex);
        state->losing = losing;
    }
    bool waitForLines(std::size_t count) const
    {
        std::unique_lock lock(state->mutex);
        return state->changed.wait_for(lock, 20s, [&] { return state->lines.size() >= count; });
    }
};

TEST(LinuxSystemLog, WritesInOrderWithTheirLevels)
{
    const StuckSink sink;
    sink.open();
    {
        LinuxSystemLog log(sink);
        log.write(Priority::Error, "one");
        log.write(Priority::Warning, "two");
        log.write(Priority::Notice, "three");
        log.write(Priority::Raw16, "four");
    }
    using Line = std::pair<int, std::string>;
    EXPECT_THAT(sink.state->lines, ElementsAre(Line{3, "one"}, Line{4, "two"}, Line{5, "three"}, Line{5, "four"}));
}

TEST(LinuxSystemLog, CutsLongLinesBetweenCharactersAndMarksThem)
{
    const StuckSink sink;
    sink.open();
    const std::string longest(8192, 'x'), euros = [] {
        std::string text;
        for (int i = 0; i < 1'000'000; ++i)
            text += "\u20AC"; // three bytes
        return text;
    }();
    {
        LinuxSystemLog log(sink);
        log.write(Priority::Error, longest);
        log.write(Priority::Error, longest + "y");
        log.write(Priority::Error, euros);
        log.write(Priority::Error, std::string(10'000, '\x80')); // not UTF-8
    }
    ASSERT_EQ(sink.state->lines.size(), 4u);
    EXPECT_EQ(sink.state->lines[0].second, longest);
    EXPECT_EQ(sink.state->lines[1].second, std::string(8189, 'x') + "\u2026");
    EXPECT_EQ(sink.state->lines[2].second, euros.substr(0, 8187) + "\u2026");
    EXPECT_EQ(sink.state->lines[3].second, std::string(8189, '\x80') + "\u2026");
}

TEST(LinuxSystemLog, NeverWaitsForADaemonThatHangsAndCountsWhatIsLost)
{
    const StuckSink sink;
    LinuxSystemLog log(sink, LOG_INFO, 10);
    log.write(Priority::Error, "stuck");
    ASSERT_TRUE(sink.waitForLines(1));
    for (int i = 0; i < 1000; ++i)
        log.write(Priority::Error, "line " + std::to_string(i)); // would block here if the log waited for its sink
    sink.open();
    ASSERT_TRUE(sink.waitForLines(12));
    const std::lock_guard lock(sink.state->mutex);
    EXPECT_EQ(sink.state->lines[1].second, "line 0");
    EXPECT_EQ(sink.state->lines[10].second, "line 9");
    EXPECT_EQ(sink.state->lines[11].second, "990 log lines were lost");
}

TEST(LinuxSystemLog, ErrorsTakeThePlacesOfTheOldestTraceLines)
{
    const StuckSink sink;
    LinuxSystemLog log(sink, LOG_INFO, 4);
    log.write(Priority::Error, "stuck");
    ASSERT_TRUE(sink.waitForLines(1));
    for (const auto* each : {"trace 1", "trace 2", "trace 3"})
        log.write(Priority::Warning, each);
    for (const auto* each : {"error 1", "error 2", "error 3"})
        log.write(Priority::Error, each);
    log.write(Priority::Warning, "trace 4");
    log.write(Priority::Error, "error 4");
    sink.open();
    ASSERT_TRUE(sink.waitForLines(6));
    const std::lock_guard lock(sink.state->mutex);
    std::vector<std::string> texts;
    for (const auto& line : sink.state->lines)
        texts.push_back(line.second);
    EXPECT_THAT(texts, ElementsAre("stuck", "error 1", "error 2", "error 3", "error 4", "4 log lines were lost"));
}

TEST(LinuxSystemLog, KeepsTheOrderOfErrorsAndOthers)
{
    const StuckSink sink;
    {
        LinuxSystemLog log(sink);
        for (const auto priority : {Priority::Warning, Priority::Error, Priority::Notice, Priority::Error})
            log.write(priority, std::to_string(static_cast<int>(priority)));
        sink.open();
    }
    std::string order;
    for (const auto& line : sink.state->lines)
        order += line.second;
    EXPECT_EQ(order, "4353");
}

TEST(LinuxSystemLog, TellsOfLostLinesDuringAFloodThatDoesNotEnd)
{
    std::mutex mutex;
    std::condition_variable changed;
    std::size_t reports = 0;
    LinuxSystemLog log(
        [&](int, const std::string& text) {
            const std::lock_guard lock(mutex);
            reports += text.ends_with("log lines were lost");
            changed.notify_all();
            return true;
        },
        LOG_INFO, 10);
    const auto end = steady_clock::now() + 20s;
    for (bool told = false; !told && steady_clock::now() < end;) {
        for (int i = 0; i < 100; ++i)
            log.write(Priority::Error, "line");
        const std::lock_guard lock(mutex);
        told = reports >= 2;
    }
    EXPECT_GE(reports, 2u);
}

TEST(LinuxSystemLog, EndsThoughItsDaemonHangs)
{
    const StuckSink sink;
    const auto before = steady_clock::now();
    {
        LinuxSystemLog log(sink);
        log.write(Priority::Error, "stuck");
        ASSERT_TRUE(sink.waitForLines(1));
    }
    EXPECT_LT(steady_clock::now() - before, 10s);
    sink.open();
}

TEST(LinuxSystemLog, TakesTheWholeQueueAtOnce)
{
    const StuckSink sink;
    LinuxSystemLog log(sink, LOG_INFO, 4);
    log.write(Priority::Error, "stuck");
    ASSERT_TRUE(sink.waitForLines(1));
    for (int i = 1; i <= 4; ++i)
        log.write(Priority::Error, "line " + std::to_string(i));
    sink.release(1);
    ASSERT_TRUE(sink.waitForLines(2));
    for (int i = 5; i <= 8; ++i)
        log.write(Priority::Error, "line " + std::to_string(i)); // all of the queue is free again
    sink.open();
    ASSERT_TRUE(sink.waitForLines(9));
    const std::lock_guard lock(sink.state->mutex);
    EXPECT_EQ(sink.state->lines.back().second, "line 8");
}

TEST(LinuxSystemLog, CountsTheLinesThatItsSinkLoses)
{
    const StuckSink sink;
    sink.setLosing(true);
    LinuxSystemLog log(sink);
    log.write(Priority::Error, "one");
    ASSERT_TRUE(sink.waitForLines(1));
    log.write(Priority::Error, "two");
    log.write(Priority::Error, "three");
    sink.open();
    ASSERT_TRUE(sink.waitForLines(5));
    sink.setLosing(false);
    log.write(Priority::Error, "four");
    ASSERT_TRUE(sink.waitForLines(7));
    const std::lock_guard lock(sink.state->mutex);
    std::vector<std::string> texts;
    for (const auto& line : sink.state->lines)
        texts.push_back(line.second);
    EXPECT_THAT(texts, ElementsAre("one", "1 log lines were lost", "two", "three", "3 log lines were lost", "four",
                                   "3 log lines were lost"));
}

TEST(LinuxSystemLog, PassesOnWhatItsLevelAllows)
{
    const auto passed = [](int level) {
        const StuckSink sink;
        sink.open();
        std::string lines;
        {
            LinuxSystemLog log(sink, level);
            for (const auto& [priority, text] : {std::pair{Priority::Error, "error "},
                                                 {Priority::Warning, "warning "},
                                                 {Priority::Notice, "notice "},
                                                 {Priority::Raw16, "raw "}}) {
                log.write(priority, text);
                log.write(priority, "%s", text);
            }
        }
        for (const auto& line : sink.state->lines)
            lines += line.second;
        return lines;
    };
    EXPECT_EQ(passed(LOG_ERR), "error error ");
    EXPECT_EQ(passed(LOG_WARNING), "error error warning warning ");
    EXPECT_EQ(passed(LOG_NOTICE), "error error warning warning notice notice raw raw ");
    EXPECT_EQ(passed(LOG_INFO), "error error warning warning notice notice raw raw ");
}

/// An argument that counts how often it is formatted.
struct Counted {
    int& count;
    operator std::string_view() const
    {
        ++count;
        return "text";
    }
};

TEST(LinuxSystemLog, DoesNotFormatWhatDoesNotPass)
{
    const StuckSink sink;
    sink.open();
    int count = 0;
    LinuxSystemLog log(sink, LOG_WARNING);
    log.write(Priority::Notice, "%s", Counted{count});
    EXPECT_EQ(count, 0);
    log.write(Priority::Warning, "%s", Counted{count});
    EXPECT_EQ(count, 1);
}

TEST(LogLevel, IsNamedByKestrumLog)
{
    constexpr int kUnset = LOG_DEBUG;
    const auto named = [](std::optional<std::string> value) {
        const ScopedVariable variable("KESTRUM_LOG", std::move(value));
        return logLevel("program", kUnset);
    };
    EXPECT_EQ(named("error"), LOG_ERR);
    EXPECT_EQ(named("warning"), LOG_WARNING);
    EXPECT_EQ(named("notice"), LOG_NOTICE);
    EXPECT_EQ(named("info"), LOG_INFO);
    EXPECT_EQ(named(std::nullopt), kUnset);
    EXPECT_EQ(named(""), kUnset);
}

TEST(LogLevel, ReportsAnotherNameInOneLine)
{
    const ScopedVariable variable("KESTRUM_LOG", "Error");
    testing::internal::CaptureStderr();
    EXPECT_EQ(logLevel("program", LOG_ERR), LOG_ERR);
    EXPECT_EQ(testing::internal::GetCapturedStderr(),
              "program: KESTRUM_LOG=Error is none of error, warning, notice, info\n");
}

/// A log daemon at a path of the test.
class Daemon {
public:
    explicit Daemon(const std::string& path) : _path(path), _descriptor(::socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0))
    {
        sockaddr_un address{};
        address.sun_family = AF_UNIX;
        path.copy(address.sun_path, sizeof address.sun_path - 1);
        EXPECT_EQ(::bind(_descriptor, reinterpret_cast<const sockaddr*>(&address), sizeof address), 0);
    }
    Daemon(const Daemon&) = delete;
    Daemon& operator=(const Daemon&) = delete;
    ~Daemon()
    {
        ::close(_descriptor);
        ::unlink(_path.c_str());
    }

    /// The next line without its time stamp, "Nov  2 06:05:42 "; empty when there is none.
    std::string line() const
    {
        char bytes[512];
        const auto count = ::recv(_descriptor, bytes, sizeof bytes, MSG_DONTWAIT);
        std::string text(bytes, count > 0 ? static_cast<std::size_t>(count) : 0);
        constexpr std::size_t kStamp = 16;
        if (const auto end = text.find('>'); end != std::string::npos && text.size() > end + kStamp)
            text.erase(end + 1, kStamp);
        return text;
    }

private:
    std::string _path;
    int _descriptor;
};

class SyslogSocketTest : public testing::Test {
protected:
    std::string path() const { return directory / "log"; }
    static std::string from(const std::string& text) { return "program[" + std::to_string(::getpid()) + "]: " + text; }

    ScratchDirectory directory;
    steady_clock::time_point now{1h};
    SyslogSocket socket{"program", path(), [this] { return now; }};
};

TEST_F(SyslogSocketTest, WritesLinesAsTheDaemonExpectsThem)
{
    const Daemon daemon(path());
    EXPECT_TRUE(socket.write(LOG_ERR, "one"));
    EXPECT_TRUE(socket.write(LOG_NOTICE, "two"));
    EXPECT_EQ(daemon.line(), "<11>" + from("one"));
    EXPECT_EQ(daemon.line(), "<13>" + from("two"));
    EXPECT_EQ(daemon.line(), "");
}

TEST_F(SyslogSocketTest, TriesAgainFiveSecondsAfterAFailure)
{
    EXPECT_FALSE(socket.write(LOG_ERR, "no daemon"));
    const Daemon daemon(path());
    now += SyslogSocket::kPause - 1ms;
    EXPECT_FALSE(socket.write(LOG_ERR, "too early"));
    now += 1ms;
    EXPECT_TRUE(socket.write(LOG_ERR, "in time"));
    EXPECT_EQ(daemon.line(), "<11>" + from("in time"));
}

TEST_F(SyslogSocketTest, FindsADaemonThatWasRestartedAtOnce)
{
    std::optional<Daemon> daemon(path());
    EXPECT_TRUE(socket.write(LOG_ERR, "before"));
    daemon.reset();
    daemon.emplace(path());
    EXPECT_TRUE(socket.write(LOG_ERR, "after"));
    EXPECT_EQ(daemon->line(), "<11>" + from("after"));
}

TEST_F(SyslogSocketTest, RefusesAPathThatIsNoDatagramSocket)
{
    writeFile(path(), "a file");
    EXPECT_FALSE(socket.write(LOG_ERR, "lost"));
    EXPECT_FALSE(SyslogSocket("program", std::string(200, 'x')).write(LOG_ERR, "lost"));
}

} // namespace
} // namespace kestrum
