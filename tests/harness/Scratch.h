#pragma once

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>

namespace kestrum {

/// An empty directory for the test. It is removed with its contents, together with this object.
class ScratchDirectory {
public:
    ScratchDirectory()
    {
        _path = (std::filesystem::temp_directory_path() / "kestrum-test-XXXXXX").string();
        if (::mkdtemp(_path.data()) == nullptr)
            throw std::runtime_error("no scratch directory");
    }
    ScratchDirectory(const ScratchDirectory&) = delete;
    ScratchDirectory& operator=(const ScratchDirectory&) = delete;
    ~ScratchDirectory()
    {
        std::error_code ignored;
        std::filesystem::remove_all(_path, ignored);
    }

    const std::string& path() const { return _path; }
    std::string operator/(const std::string& name) const { return _path + "/" + name; }

private:
    std::string _path;
};

/// Writes a file, and creates the directories above it.
inline void writeFile(const std::string& path, std::string_view text)
{
    std::filesystem::create_directories(std::filesystem::path(path).parent_path());
    std::ofstream(path) << text;
}

/// Sets or removes an environment variable as long as this object lives.
class ScopedVariable {
public:
    ScopedVariable(const char* name, std::optional<std::string> value) : _name(name)
    {
        if (const char* before = std::getenv(name))
            _before = before;
        set(value);
    }
    ScopedVariable(const ScopedVariable&) = delete;
    ScopedVariable& operator=(const ScopedVariable&) = delete;
    ~ScopedVariable() { set(_before); }

private:
    void set(const std::optional<std::string>& value)
    {
        if (value)
            ::setenv(_name, value->c_str(), 1);
        else
            ::unsetenv(_name);
    }

    const char* _name;
    std::optional<std::string> _before;
};

} // namespace kestrum
