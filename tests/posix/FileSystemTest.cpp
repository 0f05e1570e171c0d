#include "harness/Scratch.h"
#include "platform/posix/LinuxFileSystem.h"
#include "platform/posix/UserDirectories.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <pwd.h>
#include <sys/stat.h>
#include <unistd.h>

namespace kestrum {
namespace {

TEST(LinuxFileSystem, LooksUnderTheDeviceRoot)
{
    const ScratchDirectory root;
    writeFile(root / "Library/Carrier Settings.bundle/file", "");
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

TEST(LinuxFileSystem, RefusesAConfigurationThatIsNoFile)
{
    const ScratchDirectory home;
    const ScopedVariable configuration("XDG_CONFIG_HOME", home.path());
    std::filesystem::create_directories(home / "kestrum/folder");
    ASSERT_EQ(::mkfifo((home / "kestrum/pipe").c_str(), 0600), 0);
    for (const char* name : {"folder", "pipe"}) {
        const auto found = LinuxFileSystem().configuration(name);
        EXPECT_EQ(found.problem, (Problem{"it is not a regular file"})) << name;
        EXPECT_EQ(found.path, home / "kestrum/" + name);
    }
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

} // namespace
} // namespace kestrum
