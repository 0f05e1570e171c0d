#pragma once

#include <string>
#include <string_view>

namespace kestrum {

/// The device's file system.
class FileSystem {
public:
    virtual ~FileSystem() = default;

    /// Whether a file or directory stands at the absolute device path.
    virtual bool exists(std::string_view path) const = 0;

    /// The directory in which the device collects diagnostic logs; it need not exist yet.
    virtual std::string diagnosticLogDirectory() const = 0;
};

} // namespace kestrum
