#pragma once

#include "support/Bytes.h"

#include <cstdint>
#include <string>
#include <sys/types.h>

namespace kestrum {

/// A file that is there whole or not at all: it is written beside its place under another name, for its owner's eyes
/// alone (mode 0600), brought to the disk, and then given its name. No link at its place is followed. All throw
/// std::system_error, with the path.
class WholeFile {
public:
    explicit WholeFile(std::string path);
    /// Removes what was not finished.
    ~WholeFile();
    WholeFile(const WholeFile&) = delete;
    WholeFile& operator=(const WholeFile&) = delete;

    void write(Bytes bytes);

    enum class Existing { Kept, Replaced };
    /// Gives the file its name; false when something has it that is to be kept.
    bool finish(Existing existing);

    /// Which file it is, wherever its name leads later.
    struct Identity {
        ::dev_t device = 0;
        ::ino_t number = 0;

        friend bool operator==(const Identity&, const Identity&) = default;
    };
    Identity identity() const;
    /// Of what stands at the path, links not followed; none when there is nothing.
    static Identity at(const std::string& path);

private:
    void store();
    [[noreturn]] void fail() const;

    std::string _path, _written; ///< `_written`: what it is called meanwhile; empty once it is finished
    std::string _held;           ///< not yet written
    int _file;
};

} // namespace kestrum
