#pragma once

#include "support/Bytes.h"

#include <cstdint>
#include <string>
#include <sys/types.h>

namespace kestrum {

/// Writes a file that is complete or does not exist. The bytes go to a temporary file in the same directory (mode
/// 0600), are synced to the disk, and then the file gets its name. A symbolic link at the path is not followed. All
/// operations throw std::system_error with the path.
class WholeFile {
public:
    explicit WholeFile(std::string path);
    /// Creates the directory of a path where it is missing. The constructor reports one that is still missing.
    static void createDirectoryOf(const std::string& path);
    /// Removes a file that was not finished.
    ~WholeFile();
    WholeFile(const WholeFile&) = delete;
    WholeFile& operator=(const WholeFile&) = delete;

    void write(Bytes bytes);

    enum class Existing { Kept, Replaced };
    /// Gives the file its name. False when the name is taken and `existing` is Kept.
    bool finish(Existing existing);

    /// Identifies a file independently of its name.
    struct Identity {
        ::dev_t device = 0;
        ::ino_t number = 0;

        friend bool operator==(const Identity&, const Identity&) = default;
    };
    Identity identity() const;
    /// The identity of the file at the path, or of the link itself; a default Identity when there is none.
    static Identity at(const std::string& path);

private:
    void store();
    [[noreturn]] void fail() const;

    std::string _path, _written; ///< `_written`: the temporary name; empty when finished
    std::string _held;           ///< bytes not yet written
    int _file;
};

} // namespace kestrum
