#pragma once

#include "platform/Bundle.h"

#include <string>
#include <vector>

namespace kestrum {

/// Resources as files. Looked for in $KESTRUM_RESOURCES, in "resources" beside the program (a build folder has a link
/// there), and in share/kestrum of the prefix in which the program stands, wherever that is; in this order.
class LinuxBundle final : public Bundle {
public:
    LinuxBundle();
    /// In these directories alone.
    explicit LinuxBundle(std::vector<std::string> directories) : _directories(std::move(directories)) {}

    std::optional<std::string> pathForResource(std::string_view name, std::string_view type) const override;
    std::vector<std::string> pathsForResourcesOfType(std::string_view type) const override;
    std::optional<std::string> version() const override;

private:
    std::vector<std::string> _directories;
};

} // namespace kestrum
