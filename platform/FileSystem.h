#pragma once

#include <string>
#include <string_view>

namespace kestrum {

/// The device's file system.
class FileSystem {
public:
    virtual ~FileSystem() = default;

    /// Whether a file or directory exists at the absolute device path.
    virtual bool exists(std::string_view path) const = 0;

    /// The path of the device's directory of diagnostic logs. The directory may not exist yet.
    virtual std::string diagnosticLogDirectory() const = 0;
};

} // namespace kestrum
