#include "platform/linux/LinuxFileSystem.h"

#include <cstdlib>
#include <filesystem>

namespace kestrum {
namespace {

// Empty when it is not set.
std::string environment(const char* name)
{
    const char* const value = std::getenv(name);
    return value == nullptr ? std::string() : std::string(value);
}

} // namespace

LinuxFileSystem::LinuxFileSystem() : _root(environment("KESTRUM_DEVICE_ROOT"))
{
    while (_root.ends_with('/'))
        _root.pop_back();
}

bool LinuxFileSystem::exists(std::string_view path) const
{
    std::error_code unreachable;
    return std::filesystem::exists(_root + std::string(path), unreachable);
}

std::string LinuxFileSystem::diagnosticLogDirectory() const
{
    if (!_root.empty())
        return _root + "/var/log/diagnostics";
    const auto state = environment("XDG_STATE_HOME");
    return (state.empty() ? environment("HOME") + "/.local/state" : state) + "/kestrum/DiagnosticLogs";
}

} // namespace kestrum
