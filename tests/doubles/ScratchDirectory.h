#pragma once

#include <cstdlib>
#include <filesystem>
#include <stdexcept>
#include <string>

namespace kestrum {

/// An empty directory for the test. It is removed with its contents.
class ScratchDirectory {
public:
    ScratchDirectory()
    {
        _path = (std::filesystem::temp_directory_path() / "kestrum-test-XXXXXX").string();
        if (mkdtemp(_path.data()) == nullptr)
            throw std::runtime_error("no scratch directory");
    }
    ~ScratchDirectory()
    {
        std::error_code ignored;
        std::filesystem::remove_all(_path, ignored);
    }
    ScratchDirectory(const ScratchDirectory&) = delete;
    ScratchDirectory& operator=(const ScratchDirectory&) = delete;

    const std::string& path() const { return _path; }
    std::string file(const std::string& name) const { return _path + "/" + name; }

private:
    std::string _path;
};

} // namespace kestrum
