#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

/// The resources that ship beside the program.
class Bundle {
public:
    virtual ~Bundle() = default;

    /// The path of the resource `name`.`type`; nothing when there is none.
    virtual std::optional<std::string> pathForResource(std::string_view name, std::string_view type) const = 0;

    /// The paths of all resources of a type, sorted.
    virtual std::vector<std::string> pathsForResourcesOfType(std::string_view type) const = 0;

    /// The application's version, "1.0"; nothing when the bundle has none.
    virtual std::optional<std::string> version() const = 0;
};

} // namespace kestrum
