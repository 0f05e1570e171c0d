#pragma once

#include "platform/Bundle.h"

#include <string>
#include <vector>

namespace kestrum {

/// Resources as files. Searched in this order: $KESTRUM_RESOURCES, "resources" beside the program (in a build folder a
/// link), share/kestrum of the prefix in which the program is installed.
class LinuxBundle final : public Bundle {
public:
    LinuxBundle();
    /// Searches these directories only.
    explicit LinuxBundle(std::vector<std::string> directories) : _directories(std::move(directories)) {}

    std::optional<std::string> pathForResource(std::string_view name, std::string_view type) const override;
    std::vector<std::string> pathsForResourcesOfType(std::string_view type) const override;
    std::optional<std::string> version() const override;

private:
    std::vector<std::string> _directories;
};

} // namespace kestrum
