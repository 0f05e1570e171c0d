#include "platform/linux/RuntimeDirectory.h"

#include "support/Format.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <filesystem>

#include <sys/stat.h>
#include <unistd.h>

namespace kestrum {

std::string runtimeDirectory()
{
    if (const char* named = std::getenv("KESTRUM_RUNTIME_DIR"); named != nullptr && *named != '\0')
        return named;
    if (const char* session = std::getenv("XDG_RUNTIME_DIR"); session != nullptr && *session != '\0')
        return std::string(session) + "/kestrum";
    return formatted("/tmp/kestrum-%u", ::getuid());
}

std::string secureRuntimeDirectory(const std::string& directory)
{
    std::error_code ignored; // mkdir below tells what is wrong with a parent that could not be made
    std::filesystem::create_directories(std::filesystem::path(directory).parent_path(), ignored);
    if (::mkdir(directory.c_str(), 0700) != 0 && errno != EEXIST)
        return formatted("cannot create %s: %s", directory, std::strerror(errno));
    struct stat found {};
    // lstat: in a directory that others can write, a link may have been laid.
    if (::lstat(directory.c_str(), &found) != 0)
        return formatted("cannot look at %s: %s", directory, std::strerror(errno));
    if (!S_ISDIR(found.st_mode))
        return formatted("%s is no directory", directory);
    if (found.st_uid != ::geteuid())
        return formatted("%s belongs to another user", directory);
    if ((found.st_mode & 0777) != 0700 && ::chmod(directory.c_str(), 0700) != 0)
        return formatted("cannot close %s to others: %s", directory, std::strerror(errno));
    return {};
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
