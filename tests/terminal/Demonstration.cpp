#include "Demonstration.h"
#include "harness/Places.h"

#include <csignal>
#include <cstdint>
#include <cstdlib>
#include <fstream>
#include <stdexcept>
#include <sys/wait.h>
#include <unistd.h>

namespace kestrum {

Demonstration::Demonstration()
{
    std::string pattern = (std::filesystem::temp_directory_path() / "kestrum-terminal-XXXXXX").string();
    if (!mkdtemp(pattern.data()))
        throw std::runtime_error("no temporary directory");
    _directory = pattern;
    std::filesystem::create_directories(_directory / "run");
    std::filesystem::permissions(_directory / "run", std::filesystem::perms::owner_all);
    std::filesystem::create_directories(_directory / "device");
}

Demonstration::~Demonstration()
{
    killService();
    std::error_code ignored;
    std::filesystem::remove_all(_directory, ignored);
}

void Demonstration::serve(const std::vector<std::string>& displays, const std::vector<std::string>& options)
{
    const auto capture = (_directory / "displays.kcap").string();
    writeCapture(capture, displays);
    _arguments = {builtProgram("voxd"), "--replay", capture};
    _arguments.insert(_arguments.end(), options.begin(), options.end());
    restartService();
}

void Demonstration::killService()
{
    if (_service <= 0)
        return;
    kill(_service, SIGKILL);
    waitpid(_service, nullptr, 0);
    _service = -1;
}

void Demonstration::signalService(int number)
{
    kill(_service, number);
}

void Demonstration::restartService()
{
    killService();
    int said[2];
    if (pipe(said) != 0)
        throw std::runtime_error("no pipe");
    _service = fork();
    if (_service == 0) {
        dup2(said[1], STDOUT_FILENO);
        close(said[0]);
        close(said[1]);
        std::signal(SIGPIPE, SIG_DFL); // the process that runs the tests may ignore it
        for (const auto& [name, value] : environment())
            setenv(name.c_str(), value.c_str(), 1);
        std::vector<char*> argv;
        for (const auto& each : _arguments)
            argv.push_back(const_cast<char*>(each.c_str()));
        argv.push_back(nullptr);
        execv(argv[0], argv.data());
        _exit(127);
    }
    close(said[1]);
    // It writes a line once it accepts clients, and none when it cannot start.
    char byte = 0;
    const bool serves = read(said[0], &byte, 1) == 1;
    close(said[0]);
    if (!serves)
        throw std::runtime_error("voxd does not serve");
}

void Demonstration::offerSave()
{
    std::filesystem::create_directories(_directory /
                                        "device/NorvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle");
}

std::size_t Demonstration::displaysSockets() const
{
    std::size_t sockets = 0;
    for (const auto& each : std::filesystem::directory_iterator(_directory / "run"))
        sockets += each.path().filename().string().find(".log.") != std::string::npos;
    return sockets;
}

std::map<std::string, std::string> Demonstration::environment() const
{
    return {{"KESTRUM_RUNTIME_DIR", (_directory / "run").string()},
            {"KESTRUM_DEVICE_ROOT", (_directory / "device").string()},
            {"HOME", _directory.string()},
            {"XDG_CONFIG_HOME", (_directory / "config").string()}};
}

void writeCapture(const std::string& path, const std::vector<std::string>& messages)
{
    std::ofstream file(path, std::ios::binary);
    for (const auto& each : messages) {
        for (unsigned shift = 0; shift < 32; shift += 8)
            file.put(static_cast<char>(each.size() >> shift & 0xFF));
        file << each;
    }
}

std::string propertyList(const std::string& entries)
{
    return R"(<?xml version="1.0" encoding="UTF-8"?><plist version="1.0"><dict>)" + entries + "</dict></plist>";
}

std::string text(std::string_view key, std::string_view value)
{
    return "<key>" + std::string(key) + "</key><string>" + std::string(value) + "</string>";
}

std::string dictionary(std::string_view key, const std::string& entries)
{
    return "<key>" + std::string(key) + "</key><dict>" + entries + "</dict>";
}

} // namespace kestrum
