#include "platform/posix/LinuxSystemLog.h"

#include <gmock/gmock.h>

#include <condition_variable>
#include <mutex>

namespace kestrum {
namespace {

using namespace std::chrono;
using namespace std::chrono_literals;
using testing::ElementsAre;

/// A sink that blocks until the test releases it.
struct StuckSink {
    void operator()(int level, const std::string& text)
    {
        std::unique_lock lock(state->mutex);
        state->lines.emplace_back(level, text);
        state->changed.notify_all();
        state->changed.wait(lock, [&] { return state->open; });
    }
    struct State {
        std::mutex mutex;
        std::condition_variable changed;
        bool open = false;
        std::vector<std::pair<int, std::string>> lines;
    };
    std::shared_ptr<State> state = std::make_shared<State>();

    void open() const
    {
        const std::lock_guard lock(state->mutex);
        state->open = true;
        state->changed.notify_all();
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
    EXPECT_EQ(sink.state->lines[3].second, std::string(8186, '\x80') + "\u2026");
}

TEST(LinuxSystemLog, NeverWaitsForADaemonThatHangsAndCountsWhatIsLost)
{
    const StuckSink sink;
    LinuxSystemLog log(sink, 10);
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
    LinuxSystemLog log(sink, 4);
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
        },
        10);
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

} // namespace
} // namespace kestrum
