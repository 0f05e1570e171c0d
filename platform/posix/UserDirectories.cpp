#include "platform/posix/UserDirectories.h"

#include <cstdlib>
#include <string_view>

#include <pwd.h>
#include <unistd.h>

namespace kestrum {
namespace {

bool isUsable(const char* path)
{
    return path != nullptr && std::string_view(path).starts_with('/');
}

std::string home()
{
    if (const char* named = std::getenv("HOME"); isUsable(named))
        return named;
    const passwd* const user = ::getpwuid(::geteuid());
    return user != nullptr && isUsable(user->pw_dir) ? user->pw_dir : "/nonexistent";
}

} // namespace

std::string userDirectory(const char* variable, const std::string& fallback)
{
    if (const char* named = std::getenv(variable); isUsable(named))
        return named;
    return home() + "/" + fallback;
}

} // namespace kestrum
