#include "platform/qt/LinuxPreferences.h"
#include "harness/FileContents.h"
#include "harness/Scratch.h"
#include "qtplatform/EventLoop.h"

#include <QProcess>
#include <gtest/gtest.h>

namespace kestrum {
namespace {

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

TEST(LinuxPreferences, KeepTheOtherEntriesOfTheDomain)
{
    const ScratchDirectory home;
    const ScopedVariable config("XDG_CONFIG_HOME", home.path());
    writeFile(home / "org.kestrum.homescreen.ini", "[preferences]\nHXShowGSMRSSI=true\nOther=7\n");
    LinuxPreferences preferences;
    preferences.setApplicationValue("org.kestrum.homescreen", "HXShowGSMRSSI", false);
    EXPECT_TRUE(preferences.synchronize("org.kestrum.homescreen"));
    EXPECT_EQ(contentsOf(home / "org.kestrum.homescreen.ini"), "[preferences]\nHXShowGSMRSSI=false\nOther=7\n");
}

TEST(LinuxPreferences, SayWhenTheyCannotBeWritten)
{
    const ScratchDirectory home;
    writeFile(home / "file", "");
    const ScopedVariable config("XDG_CONFIG_HOME", home / "file");
    LinuxPreferences preferences;
    preferences.setApplicationValue("org.kestrum.homescreen", "HXShowGSMRSSI", false);
    EXPECT_FALSE(preferences.synchronize("org.kestrum.homescreen"));
}

TEST(LinuxPreferences, AnnounceTheChangeOnTheSessionBus)
{
    // A separate bus, and a listener.
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
    ASSERT_TRUE(eventually([&] { // it reports its own name as soon as it listens
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

} // namespace
} // namespace kestrum
