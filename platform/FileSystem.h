#pragma once

#include "platform/Stored.h"
#include "support/Bytes.h"
#include "support/Problem.h"

#include <cstddef>
#include <functional>
#include <optional>
#include <string>
#include <string_view>

namespace kestrum {

/// A configuration file of the user.
struct Configuration {
    std::string path;
    std::string text = {};               ///< empty when there is no such file, and with a problem
    std::optional<Problem> problem = {}; ///< it is there and cannot be read, or is too long
};

/// The device's file system.
class FileSystem {
public:
    static constexpr std::size_t kLongestConfiguration = 64 << 10; ///< bytes

    virtual ~FileSystem() = default;

    /// Whether a file or directory exists at the absolute device path.
    virtual bool exists(std::string_view path) const = 0;

    /// The path of the device's directory of diagnostic logs. The directory may not exist yet.
    virtual std::string diagnosticLogDirectory() const = 0;

    /// The user's configuration file of that name.
    virtual Configuration configuration(std::string_view name) const = 0;

    using Write = std::function<void(Bytes)>;
    /// Creates a file that only the user can read. `contents` writes it piece by piece, during the call. The file is
    /// complete or does not exist. Creates a missing directory. Replaces nothing.
    virtual Stored create(const std::string& path, const std::function<void(const Write&)>& contents) = 0;
};

} // namespace kestrum
