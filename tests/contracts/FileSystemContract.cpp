#include "contracts/Worlds.h"
#include "doubles/MemoryFileSystem.h"
#include "doubles/RecordingPreferences.h"
#include "harness/FileContents.h"
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
    void refuseToWrite() { files.writable = preferences.writable = false; }
    void configure(const std::string& name, const std::string& text) { files.configurations[name] = text; }
    std::string logs() const { return files.logDirectory; }
    std::string contentsOf(const std::string& path) { return files.files.at(path); }
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
    void refuseToWrite()
    {
        layDownFile("/config");
        layDownFile("/var");
    }
    void configure(const std::string& name, const std::string& text)
    {
        writeFile(device / "config/kestrum/" + name, text);
    }
    std::string logs() const { return device / "var/log/diagnostics"; }
    static std::string contentsOf(const std::string& path) { return kestrum::contentsOf(path); }
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

TYPED_TEST(FilesContract, ConfigurationIsReadUpToItsLimit)
{
    const auto& files = this->world.files;
    EXPECT_EQ(files.configuration("colours").text, "");
    EXPECT_EQ(files.configuration("colours").problem, std::nullopt);
    this->world.configure("colours", "a = b\n");
    const auto found = files.configuration("colours");
    EXPECT_EQ(found.text, "a = b\n");
    EXPECT_EQ(found.problem, std::nullopt);
    EXPECT_TRUE(found.path.ends_with("/colours"));
    this->world.configure("colours", std::string(FileSystem::kLongestConfiguration, 'x'));
    EXPECT_EQ(files.configuration("colours").text.size(), FileSystem::kLongestConfiguration);
    this->world.configure("colours", std::string(FileSystem::kLongestConfiguration + 1, 'x'));
    EXPECT_EQ(files.configuration("colours").text, "");
    EXPECT_TRUE(files.configuration("colours").problem);
}

TYPED_TEST(FilesContract, CreatesAFileWithItsDirectoryAndReplacesNone)
{
    auto& files = this->world.files;
    const auto path = this->world.logs() + "/new/a.txt";
    const auto write = [](const char* text) {
        return [text](const FileSystem::Write& to) {
            to(bytesOf(text));
            to(bytesOf("!"));
        };
    };
    EXPECT_EQ(files.create(path, write("first")), Stored::Written);
    EXPECT_EQ(files.create(path, write("second")), Stored::NameTaken);
    EXPECT_EQ(this->world.contentsOf(path), "first!");
}

TYPED_TEST(FilesContract, SaysThatAFileCouldNotBeCreated)
{
    this->world.refuseToWrite();
    const auto path = this->world.logs() + "/a.txt";
    EXPECT_EQ(this->world.files.create(path, [](const auto&) {}), Stored::Failed);
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
