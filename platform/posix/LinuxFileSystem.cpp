#include "platform/posix/LinuxFileSystem.h"

#include "platform/posix/UserDirectories.h"
#include "platform/posix/WholeFile.h"
#include "support/Format.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <memory>
#include <sys/stat.h>
#include <system_error>
#include <unistd.h>
#include <utility>

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

Configuration LinuxFileSystem::configuration(std::string_view name) const
{
    Configuration found{formatted("%@/kestrum/%@", userDirectory("XDG_CONFIG_HOME", ".config"), name)};
    const auto refuse = [&found](std::string reason) {
        found.text.clear();
        found.problem = Problem{std::move(reason)};
        return found;
    };
    const auto refuseByErrno = [&] { return refuse(std::generic_category().message(errno)); };
    // A pipe would block the program here.
    const int file = ::open(found.path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK);
    if (file < 0)
        return errno == ENOENT || errno == ENOTDIR ? found : refuseByErrno();
    const std::unique_ptr<const int, void (*)(const int*)> closed(&file, [](const int* each) { ::close(*each); });
    struct stat status {};
    if (::fstat(file, &status) != 0)
        return refuseByErrno();
    if (!S_ISREG(status.st_mode))
        return refuse("it is not a regular file");
    char piece[4096];
    for (ssize_t got = 0; (got = ::read(file, piece, sizeof piece)) != 0;) {
        if (got < 0 && errno != EINTR)
            return refuseByErrno();
        found.text.append(piece, static_cast<std::size_t>(std::max<ssize_t>(got, 0)));
        if (found.text.size() > kLongestConfiguration)
            return refuse(formatted("it is longer than %lu bytes", kLongestConfiguration));
    }
    return found;
}

Stored LinuxFileSystem::create(const std::string& path, const std::function<void(const Write&)>& contents)
{
    WholeFile::createDirectoryOf(path);
    try {
        WholeFile file(path);
        contents([&file](Bytes bytes) { file.write(bytes); });
        return file.finish(WholeFile::Existing::Kept) ? Stored::Written : Stored::NameTaken;
    } catch (const std::system_error&) {
        return Stored::Failed;
    }
}

} // namespace kestrum
