#pragma once

#include "platform/posix/WholeFile.h"
#include "support/Bytes.h"
#include "tools/Snapshot.h"

#include <cstdint>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace kestrum::tools {

/// Files extracted from a snapshot, named after it: the DLF stream as it was written ("-written.dlf"), and the
/// recovered messages as a clean ".dlf" and ".kcap". Writes all of them or none.
class Extraction {
public:
    /// Creates the directory if it is missing. Throws std::runtime_error when a file cannot be written, or, unless
    /// files may be replaced, with the names of those that exist. Links are replaced, never followed.
    Extraction(const std::string& directory, const Snapshot& snapshot, WholeFile::Existing existing);

    /// Adds one recovered message.
    void take(Bytes message);
    void finish();

    /// The number of messages that a DLF stream cannot hold; only the ".kcap" has them.
    std::uint64_t inKcapAlone() const { return _inKcapAlone; }

private:
    WholeFile& create(const std::string& ending);

    const std::string _stem;
    const WholeFile::Existing _existing;
    std::vector<std::pair<std::string, std::unique_ptr<WholeFile>>> _files; ///< by path
    WholeFile* _kcap = nullptr;
    WholeFile* _dlf = nullptr; ///< null: the snapshot has no such stream
    std::uint64_t _inKcapAlone = 0;
};

} // namespace kestrum::tools
