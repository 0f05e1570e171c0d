#include "platform/posix/RuntimeDirectory.h"

#include "platform/TelephonyService.h"
#include "platform/posix/VoxProtocol.h"
#include "support/Format.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <filesystem>

#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>

namespace kestrum {
namespace {

constexpr int kLargestProcess = 4'194'304; // the kernel's limit

// The longest path of the directory: a socket's path less the terminating zero, the "/" and the longest socket name.
std::size_t longestDirectory()
{
    const auto longestName = vox::addressOfPort(kLogChannelServiceName, kLargestProcess);
    return sizeof sockaddr_un::sun_path - 1 - std::string_view("/").size() - longestName.size();
}

} // namespace

std::string runtimeDirectory()
{
    if (const char* named = std::getenv("KESTRUM_RUNTIME_DIR"); named != nullptr && *named != '\0')
        return named;
    if (const char* session = std::getenv("XDG_RUNTIME_DIR"); session != nullptr && *session != '\0')
        return std::string(session) + "/kestrum";
    return formatted("/tmp/kestrum-%u", ::getuid());
}

std::optional<Problem> secureRuntimeDirectory(const std::string& named)
{
    // With a trailing slash, lstat would follow a symbolic link.
    const std::string directory = named.substr(0, named.find_last_not_of('/') + 1);
    if (!directory.starts_with('/'))
        return Problem{formatted("the runtime directory %s is not an absolute path", named)};
    if (directory.size() > longestDirectory())
        return Problem{formatted("the runtime directory %s is too long: %lu bytes, the limit is %lu", directory,
                                 directory.size(), longestDirectory())};
    std::error_code ignored; // mkdir below reports a parent that could not be created
    std::filesystem::create_directories(std::filesystem::path(directory).parent_path(), ignored);
    const bool made = ::mkdir(directory.c_str(), 0700) == 0;
    if (!made && errno != EEXIST)
        return Problem{formatted("cannot create %s: %s", directory, std::strerror(errno))};
    struct stat found {};
    // lstat: another user may have placed a symbolic link in a shared directory such as /tmp.
    if (::lstat(directory.c_str(), &found) != 0)
        return Problem{formatted("cannot read the status of %s: %s", directory, std::strerror(errno))};
    if (!S_ISDIR(found.st_mode))
        return Problem{formatted("%s is not a directory", directory)};
    if (found.st_uid != ::geteuid())
        return Problem{formatted("%s belongs to another user", directory)};
    if (made && ::chmod(directory.c_str(), 0700) == 0) // the umask may have removed bits
        return std::nullopt;
    if (const unsigned mode = found.st_mode & 0777; mode != 0700)
        return Problem{
            formatted("%s has mode 0%u%u%u, but 0700 is needed", directory, mode >> 6, mode >> 3 & 7, mode & 7)};
    return std::nullopt;
}

bool isPortName(std::string_view name)
{
    const auto allowed = [](char c) {
        return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || c == '.' || c == '-' ||
               c == '_';
    };
    return !name.empty() && name.front() != '.' && std::ranges::all_of(name, allowed);
}

} // namespace kestrum
