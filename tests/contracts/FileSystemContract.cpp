#include "contracts/Worlds.h"
#include "doubles/MemoryFileSystem.h"
#include "doubles/RecordingPreferences.h"
#include "harness/Scratch.h"
#include "platform/posix/LinuxFileSystem.h"
#include "platform/qt/LinuxPreferences.h"

#include <filesystem>
#include <fstream>

// The roles for the device's files: its file system and its preferences.
namespace kestrum {
namespace {

struct MemoryWorld {
    MemoryFileSystem files;
    RecordingPreferences preferences;

    void layDownFile(const std::string& path) { files.paths.insert(path); }
    void layDownDirectory(const std::string& path) { files.paths.insert(path); }
    void refuseToWrite() { preferences.writable = false; }
};

struct LinuxWorld {
    ScratchDirectory device;
    ScopedVariable root{"KESTRUM_DEVICE_ROOT", device.path()};
    ScopedVariable configuration{"XDG_CONFIG_HOME", device / "config"};
    ScopedVariable bus{"DBUS_SESSION_BUS_ADDRESS", std::nullopt}, runtime{"XDG_RUNTIME_DIR", device.path()};
    LinuxFileSystem files;
    LinuxPreferences preferences;

    void layDownFile(const std::string& path) { std::ofstream(device.path() + path) << "here"; }
    void layDownDirectory(const std::string& path) { std::filesystem::create_directory(device.path() + path); }
    void refuseToWrite() { layDownFile("/config"); }
};

template <typename World>
class FilesContract : public testing::Test {
protected:
    World world;
};
using Worlds = testing::Types<MemoryWorld, LinuxWorld>;
TYPED_TEST_SUITE(FilesContract, Worlds, DoubleOrAdapter);

TYPED_TEST(FilesContract, ExistingFilesAreFound)
{
    EXPECT_FALSE(this->world.files.exists("/marker"));
    this->world.layDownFile("/marker");
    EXPECT_TRUE(this->world.files.exists("/marker"));
    EXPECT_FALSE(this->world.files.exists("/mark"));
    EXPECT_FALSE(this->world.files.exists("/marker/below"));
    this->world.layDownDirectory("/Carrier Settings.bundle");
    EXPECT_TRUE(this->world.files.exists("/Carrier Settings.bundle"));
}

TYPED_TEST(FilesContract, TheDirectoryOfDiagnosticLogsIsAnAbsolutePathWithoutASlashAtItsEnd)
{
    const auto directory = this->world.files.diagnosticLogDirectory();
    EXPECT_TRUE(directory.starts_with('/'));
    EXPECT_FALSE(directory.ends_with('/'));
}

TYPED_TEST(FilesContract, PreferencesSayWhetherTheyCouldBeWritten)
{
    this->world.preferences.setApplicationValue("org.example", "Key", false);
    EXPECT_TRUE(this->world.preferences.synchronize("org.example"));
    this->world.preferences.postChanged("org.example", "Key"); // no observer yet
}

TYPED_TEST(FilesContract, PreferencesSayThatTheyCouldNotBeWritten)
{
    this->world.refuseToWrite();
    this->world.preferences.setApplicationValue("org.example", "Key", false);
    EXPECT_FALSE(this->world.preferences.synchronize("org.example"));
}

} // namespace
} // namespace kestrum
