#pragma once

#include "platform/Bundle.h"

namespace kestrum {

/// Resources under names that the test chooses. Paths are "name.type", or those of real files for loaded resources.
class MemoryBundle final : public Bundle {
public:
    std::optional<std::string> pathForResource(std::string_view name, std::string_view type) const override
    {
        const std::string file = std::string(name) + "." + std::string(type);
        for (const auto& path : paths)
            if (path == file || path.ends_with("/" + file))
                return path;
        return std::nullopt;
    }
    std::vector<std::string> pathsForResourcesOfType(std::string_view type) const override
    {
        std::vector<std::string> found;
        for (const auto& path : paths)
            if (path.ends_with(std::string(".").append(type)))
                found.push_back(path);
        return found;
    }
    std::optional<std::string> version() const override { return bundleVersion; }

    std::vector<std::string> paths;
    std::optional<std::string> bundleVersion = "1.0";
};

} // namespace kestrum
