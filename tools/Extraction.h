#pragma once

#include "support/Bytes.h"
#include "tools/Snapshot.h"

#include <cstdint>
#include <fstream>
#include <string>

namespace kestrum {

/// Files made of a snapshot, named after it: the DLF stream as it was written ("-written.dlf"), and what was recovered
/// of it as a clean ".dlf" and ".kcap".
class Extraction {
public:
    /// Makes the directory where it is missing. Throws std::runtime_error when a file cannot be written.
    Extraction(const std::string& directory, const Snapshot& snapshot);

    /// One recovered message.
    void take(Bytes message);
    void finish();

    /// Messages that a DLF stream cannot hold: they stand in the ".kcap" alone.
    std::uint64_t inKcapAlone() const { return _inKcapAlone; }

private:
    struct File {
        std::string path;
        std::ofstream stream;
    };
    static File create(const std::string& path);
    static void close(File& file);

    File _kcap, _dlf;
    std::uint64_t _inKcapAlone = 0;
};

} // namespace kestrum
