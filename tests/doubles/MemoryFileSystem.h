#pragma once

#include "platform/FileSystem.h"

#include <set>
#include <string>

namespace kestrum {

/// A device with the paths that the test adds.
class MemoryFileSystem final : public FileSystem {
public:
    bool exists(std::string_view path) const override { return paths.contains(path); }
    std::string diagnosticLogDirectory() const override { return logDirectory; }

    std::set<std::string, std::less<>> paths;
    std::string logDirectory = "/logs";
};

} // namespace kestrum
