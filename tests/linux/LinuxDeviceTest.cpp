#include "platform/linux/LinuxDevice.h"
#include "doubles/FileContents.h"
#include "linux/EventLoop.h"
#include "linux/Scratch.h"
#include "platform/Console.h"
#include "platform/MainQueue.h"
#include "platform/linux/LinuxBundle.h"
#include "platform/linux/LinuxClock.h"
#include "platform/linux/LinuxFileSystem.h"
#include "platform/linux/LinuxPreferences.h"
#include "platform/linux/LinuxSystemLog.h"
#include "platform/linux/RuntimeDirectory.h"
#include "platform/linux/TerminationSignals.h"
#include "platform/linux/UserDirectories.h"

#include <QProcess>
#include <gmock/gmock.h>

#include <condition_variable>
#include <csignal>
#include <fstream>
#include <mutex>

#include <pwd.h>

namespace kestrum {
namespace {

using namespace std::chrono;
using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::HasSubstr;

void write(const std::string& path, std::string_view text)
{
    std::filesystem::create_directories(std::filesystem::path(path).parent_path());
    std::ofstream(path) << text;
}

// 2026-11-16 06:05:42 UTC
constexpr Date kNovember = sys_days(year{2026} / 11 / 16) + 6h + 5min + 42s;
constexpr Date kJuly = sys_days(year{2026} / 7 / 1) + 12h;

TEST(LinuxClock, GivesTheOffsetEastOfUtcAndDaylightSaving)
{
    const ScopedVariable zone("TZ", "America/St_Johns");
    const LinuxClock clock;
    EXPECT_EQ(clock.zoneAt(kNovember).offset, -(3h + 30min));
    EXPECT_FALSE(clock.zoneAt(kNovember).daylightSaving);
    EXPECT_EQ(clock.zoneAt(kJuly).offset, -(2h + 30min));
    EXPECT_TRUE(clock.zoneAt(kJuly).daylightSaving);
}

TEST(LinuxClock, WritesLocalDatesByThePattern)
{
    const ScopedVariable zone("TZ", "Asia/Kolkata");
    const LinuxClock clock;
    EXPECT_EQ(clock.localText(kNovember, "'Updated' yyyy-MM-dd 'at' HH:mm:ss"), "Updated 2026-11-16 at 11:35:42");
}

TEST(LinuxClock, RunsWithTheSystems)
{
    const auto before = floor<microseconds>(system_clock::now());
    const auto now = LinuxClock().now();
    const auto after = system_clock::now();
    EXPECT_GE(now, before);
    EXPECT_LE(now, after);
}

TEST(LinuxFileSystem, LooksUnderTheDeviceRoot)
{
    const ScratchDirectory root;
    write(root / "Library/Carrier Settings.bundle/file", "");
    const ScopedVariable variable("KESTRUM_DEVICE_ROOT", root.path() + "/");
    const LinuxFileSystem files;
    EXPECT_TRUE(files.exists("/Library/Carrier Settings.bundle"));
    EXPECT_TRUE(files.exists("/Library/Carrier Settings.bundle/file"));
    EXPECT_FALSE(files.exists("/Library/Other.bundle"));
    EXPECT_FALSE(files.exists("/tmp"));
    EXPECT_EQ(files.diagnosticLogDirectory(), root / "var/log/diagnostics");
}

TEST(LinuxFileSystem, LooksInTheSystemWithoutADeviceRoot)
{
    const ScopedVariable variable("KESTRUM_DEVICE_ROOT", std::nullopt), home("HOME", "/home/x");
    EXPECT_TRUE(LinuxFileSystem().exists("/tmp"));
    {
        const ScopedVariable state("XDG_STATE_HOME", "/state");
        EXPECT_EQ(LinuxFileSystem().diagnosticLogDirectory(), "/state/kestrum/DiagnosticLogs");
    }
    const ScopedVariable state("XDG_STATE_HOME", std::nullopt);
    EXPECT_EQ(LinuxFileSystem().diagnosticLogDirectory(), "/home/x/.local/state/kestrum/DiagnosticLogs");
}

TEST(UserDirectories, IgnoreRelativePathsAndAMissingHome)
{
    const ScopedVariable state("XDG_STATE_HOME", "relative");
    {
        const ScopedVariable home("HOME", "/home/x");
        EXPECT_EQ(userDirectory("XDG_STATE_HOME", ".local/state"), "/home/x/.local/state");
    }
    const passwd* const user = ::getpwuid(::geteuid());
    const std::string own = user != nullptr ? user->pw_dir : "/nonexistent";
    for (const auto& unusable :
         {std::optional<std::string>(), std::optional<std::string>(""), std::optional<std::string>("here")}) {
        const ScopedVariable home("HOME", unusable);
        EXPECT_EQ(userDirectory("XDG_STATE_HOME", ".local/state"), own + "/.local/state");
    }
}

TEST(LinuxBundle, FindsResourcesInItsDirectoriesTheFirstHidingTheLater)
{
    const ScratchDirectory first, second;
    write(first / "LTE.plist", "1");
    write(second / "LTE.plist", "2");
    write(second / "UTRAN.plist", "3");
    write(second / "picture.png", "4");
    const LinuxBundle bundle({first.path(), second.path(), "/nowhere"});
    EXPECT_EQ(bundle.pathForResource("LTE", "plist"), first / "LTE.plist");
    EXPECT_EQ(bundle.pathForResource("UTRAN", "plist"), second / "UTRAN.plist");
    EXPECT_FALSE(bundle.pathForResource("ZPH_GSM", "plist"));
    EXPECT_THAT(bundle.pathsForResourcesOfType("plist"),
                testing::UnorderedElementsAre(first / "LTE.plist", second / "UTRAN.plist"));
    EXPECT_TRUE(std::ranges::is_sorted(bundle.pathsForResourcesOfType("plist")));
}

TEST(LinuxBundle, HasTheProgramsVersion)
{
    EXPECT_EQ(LinuxBundle().version(), "1.0.0");
}

TEST(LinuxBundle, LooksFirstWhereTheEnvironmentSays)
{
    const ScratchDirectory own;
    write(own / "Mine.plist", "");
    const ScopedVariable variable("KESTRUM_RESOURCES", own.path());
    EXPECT_EQ(LinuxBundle().pathForResource("Mine", "plist"), own / "Mine.plist");
}

TEST(LinuxPreferences, WriteABooleanWithoutABus)
{
    const ScratchDirectory home;
    const ScopedVariable config("XDG_CONFIG_HOME", home.path()), bus("DBUS_SESSION_BUS_ADDRESS", std::nullopt),
        runtime("XDG_RUNTIME_DIR", home.path());
    LinuxPreferences preferences;
    preferences.setApplicationValue("org.kestrum.homescreen", "HXShowGSMRSSI", false);
    EXPECT_FALSE(std::filesystem::exists(home / "org.kestrum.homescreen.ini")) << "kept at the next synchronize";
    EXPECT_TRUE(preferences.synchronize("org.kestrum.homescreen"));
    EXPECT_EQ(contentsOf(home / "org.kestrum.homescreen.ini"), "[preferences]\nHXShowGSMRSSI=false\n");
    preferences.postChanged("org.kestrum.homescreen", "HXShowGSMRSSI");
}

TEST(LinuxPreferences, KeepWhatElseStandsInTheDomain)
{
    const ScratchDirectory home;
    const ScopedVariable config("XDG_CONFIG_HOME", home.path());
    write(home / "org.kestrum.homescreen.ini", "[preferences]\nHXShowGSMRSSI=true\nOther=7\n");
    LinuxPreferences preferences;
    preferences.setApplicationValue("org.kestrum.homescreen", "HXShowGSMRSSI", false);
    EXPECT_TRUE(preferences.synchronize("org.kestrum.homescreen"));
    EXPECT_EQ(contentsOf(home / "org.kestrum.homescreen.ini"), "[preferences]\nHXShowGSMRSSI=false\nOther=7\n");
}

TEST(LinuxPreferences, SayWhenTheyCannotBeWritten)
{
    const ScratchDirectory home;
    write(home / "file", "");
    const ScopedVariable config("XDG_CONFIG_HOME", home / "file");
    LinuxPreferences preferences;
    preferences.setApplicationValue("org.kestrum.homescreen", "HXShowGSMRSSI", false);
    EXPECT_FALSE(preferences.synchronize("org.kestrum.homescreen"));
}

TEST(LinuxPreferences, AnnounceTheChangeOnTheSessionBus)
{
    // A bus of the test's own, and somebody who listens.
    QProcess bus;
    bus.start("dbus-daemon", {"--session", "--nofork", "--print-address=1"});
    ASSERT_TRUE(bus.waitForStarted()) << "needs the package dbus";
    ASSERT_TRUE(eventually([&] { return bus.canReadLine(); }));
    const auto address = bus.readLine().trimmed().toStdString();
    const ScopedVariable variable("DBUS_SESSION_BUS_ADDRESS", address);
    QProcess listener;
    listener.start("dbus-monitor", {"--session", "type=signal,interface=org.kestrum.Preferences"});
    ASSERT_TRUE(listener.waitForStarted());
    QByteArray heard;
    ASSERT_TRUE(eventually([&] { // it says that it has its own name once it listens
        heard += listener.readAllStandardOutput();
        return heard.contains("NameAcquired") || heard.contains("NameLost");
    }));
    LinuxPreferences().postChanged("org.kestrum.homescreen", "HXShowGSMRSSI");
    EXPECT_TRUE(eventually([&] {
        heard += listener.readAllStandardOutput();
        return heard.contains("path=/org/kestrum/Preferences; interface=org.kestrum.Preferences; member=Changed") &&
               heard.contains("string \"org.kestrum.homescreen\"") && heard.contains("string \"HXShowGSMRSSI\"");
    })) << heard.toStdString();
    for (auto* const each : {&listener, &bus}) {
        each->terminate();
        each->waitForFinished();
    }
}

/// A sink that hangs until the test lets it go on.
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

TEST(LinuxSystemLog, NeverWaitsForADaemonThatHangsAndCountsWhatIsLost)
{
    const StuckSink sink;
    LinuxSystemLog log(sink, 10);
    log.write(Priority::Error, "stuck");
    ASSERT_TRUE(sink.waitForLines(1));
    for (int i = 0; i < 1000; ++i)
        log.write(Priority::Error, "line " + std::to_string(i)); // would hang here
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

TEST(RuntimeDirectory, IsTheOneNamedElseTheSessionsElseOneInTmp)
{
    const ScopedVariable session("XDG_RUNTIME_DIR", "/run/user/7");
    {
        const ScopedVariable named("KESTRUM_RUNTIME_DIR", "/named");
        EXPECT_EQ(runtimeDirectory(), "/named");
    }
    const ScopedVariable named("KESTRUM_RUNTIME_DIR", std::nullopt);
    EXPECT_EQ(runtimeDirectory(), "/run/user/7/kestrum");
    const ScopedVariable none("XDG_RUNTIME_DIR", std::nullopt);
    EXPECT_EQ(runtimeDirectory(), "/tmp/kestrum-" + std::to_string(::getuid()));
}

std::string problemOf(const std::string& directory)
{
    return secureRuntimeDirectory(directory).value_or(Problem()).text;
}

TEST(RuntimeDirectory, IsRefusedWhenItBelongsToSomebodyElse)
{
    if (::geteuid() != 0)
        GTEST_SKIP() << "only root can give a directory away";
    const ScratchDirectory scratch;
    const auto theirs = scratch / "theirs";
    std::filesystem::create_directory(theirs);
    ASSERT_EQ(::chown(theirs.c_str(), 65534, 65534), 0);
    EXPECT_THAT(problemOf(theirs), HasSubstr("belongs to another user"));
}

TEST(RuntimeDirectory, SaysWhyItCannotBeMade)
{
    const ScratchDirectory scratch;
    write(scratch / "file", "");
    EXPECT_THAT(problemOf(scratch / "file/inside"), HasSubstr("cannot create"));
    EXPECT_THAT(problemOf(scratch / "file"), HasSubstr("is no directory"));
}

TEST(RuntimeDirectory, MayNotBeRelative)
{
    EXPECT_EQ(problemOf("run"), "the runtime directory run is not an absolute path");
    EXPECT_THAT(problemOf(""), HasSubstr("is not an absolute path"));
}

TEST(RuntimeDirectory, LeavesRoomForTheLongestSocketOfADisplay)
{
    const ScratchDirectory scratch;
    const auto ofLength = [&](std::size_t length) {
        return scratch / std::string(length - scratch.path().size() - 1, 'd');
    };
    // "/org.kestrum.vox.baseband-state-report.log.4194304" and the zero, of 108 bytes.
    EXPECT_EQ(problemOf(ofLength(57)), "");
    EXPECT_THAT(problemOf(ofLength(58)), HasSubstr("too long: 58 bytes, sockets in it leave room for 57"));
    EXPECT_FALSE(std::filesystem::exists(ofLength(58)));
}

class TerminationSignal : public testing::TestWithParam<int> {};

TEST_P(TerminationSignal, RunsTheActionFromTheEventLoop)
{
    int runs = 0;
    const TerminationSignals watch([&] { ++runs; });
    ::raise(GetParam());
    ::raise(GetParam());
    EXPECT_EQ(runs, 0);
    ASSERT_TRUE(eventually([&] { return runs > 0; }));
    EXPECT_EQ(runs, 1);
}

INSTANTIATE_TEST_SUITE_P(TerminationSignals, TerminationSignal, testing::Values(SIGTERM, SIGINT, SIGHUP),
                         [](const auto& each) { return std::string("Signal") + std::to_string(each.param); });

TEST(LinuxDevice, YieldsTheRolesAndDropsWhatIsQueued)
{
    const ScratchDirectory directory;
    const ScopedVariable runtime("KESTRUM_RUNTIME_DIR", directory.path());
    LinuxDevice device("tests", LinuxDevice::Output::Quiet);
    const auto roles = device.monitorRoles();
    EXPECT_FALSE(roles.console.isDebugWatched());
    const auto held = std::make_shared<int>(0);
    roles.queue.post([held] { ++*held; });
    device.dropQueued();
    EXPECT_EQ(held.use_count(), 1);
    bool ran = false;
    roles.queue.post([&] { ran = true; });
    EXPECT_TRUE(eventually([&] { return ran; }));
}

} // namespace
} // namespace kestrum
