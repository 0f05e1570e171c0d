#include "platform/posix/LinuxFileSystem.h"

#include "platform/posix/UserDirectories.h"

#include <cstdlib>
#include <filesystem>

namespace kestrum {

LinuxFileSystem::LinuxFileSystem()
{
    if (const char* const root = std::getenv("KESTRUM_DEVICE_ROOT"))
        _root = root;
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
    return userDirectory("XDG_STATE_HOME", ".local/state") + "/kestrum/DiagnosticLogs";
}

} // namespace kestrum
