#include "platform/posix/LinuxBundle.h"

#include "support/Format.h"

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <map>

namespace kestrum {

namespace files = std::filesystem;

LinuxBundle::LinuxBundle()
{
    if (const char* named = std::getenv("KESTRUM_RESOURCES"); named != nullptr && *named != '\0')
        _directories.emplace_back(named);
    std::error_code unknown;
    const auto program = files::read_symlink("/proc/self/exe", unknown).parent_path();
    if (!program.empty()) {
        _directories.push_back((program / "resources").string());
        _directories.push_back((program / KESTRUM_RESOURCES_FROM_PROGRAM).lexically_normal().string());
    }
}

std::optional<std::string> LinuxBundle::pathForResource(std::string_view name, std::string_view type) const
{
    for (const auto& directory : _directories) {
        const auto path = files::path(directory) / formatted("%s.%s", name, type);
        std::error_code unreachable;
        if (files::is_regular_file(path, unreachable))
            return path.string();
    }
    return std::nullopt;
}

std::vector<std::string> LinuxBundle::pathsForResourcesOfType(std::string_view type) const
{
    // By file name: a file in an earlier directory hides files of the same name in later ones.
    std::map<std::string, std::string> found;
    const std::string ending = formatted(".%s", type);
    for (const auto& directory : _directories) {
        std::error_code unreachable;
        for (const auto& entry : files::directory_iterator(directory, unreachable))
            if (entry.path().extension() == ending)
                found.emplace(entry.path().filename().string(), entry.path().string());
    }
    std::vector<std::string> paths;
    paths.reserve(found.size());
    for (const auto& [name, path] : found)
        paths.push_back(path);
    std::ranges::sort(paths);
    return paths;
}

std::optional<std::string> LinuxBundle::version() const
{
    return KESTRUM_VERSION;
}

} // namespace kestrum
