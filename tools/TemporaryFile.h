#pragma once

#include <cstdio>
#include <functional>
#include <memory>
#include <string_view>

namespace kestrum::tools {

/// An unnamed file for output that has to wait. All operations throw OutputFailure.
class TemporaryFile {
public:
    TemporaryFile();

    int descriptor() const { return ::fileno(_file.get()); }
    void append(std::string_view text);
    /// Passes everything that was written, from the start and in pieces. The next `append` continues at the end.
    void read(const std::function<void(std::string_view piece)>& take);

private:
    std::unique_ptr<std::FILE, int (*)(std::FILE*)> _file;
};

} // namespace kestrum::tools
