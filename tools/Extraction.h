#pragma once

#include "platform/propertylist/WholeFile.h"
#include "support/Bytes.h"
#include "tools/Snapshot.h"

#include <cstdint>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace kestrum::tools {

/// Files made of a snapshot, named after it: the DLF stream as it was written ("-written.dlf"), and what was recovered
/// of it as a clean ".dlf" and ".kcap". All of them, or none.
class Extraction {
public:
    /// Makes the directory where it is missing. Throws std::runtime_error, naming the files that exist unless they are
    /// to be replaced, and when a file cannot be written. Links are replaced, never followed.
    Extraction(const std::string& directory, const Snapshot& snapshot, WholeFile::Existing existing);

    /// One recovered message.
    void take(Bytes message);
    void finish();

    /// Messages that a DLF stream cannot hold: they stand in the ".kcap" alone.
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
