#pragma once

#include "capture/RecordReader.h"
#include "support/Record.h"
#include "support/Value.h"

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {
class PropertyLists;
}

namespace kestrum::tools {

/// What a snapshot file holds, as it says itself.
struct SnapshotListing {
    struct Entry {
        std::string description;  ///< empty where it has none
        std::string date;         ///< empty where it has none
        std::uint64_t size = 0;   ///< of the raw records or the DLF stream, bytes; of a tree, values
        std::string_view content; ///< "records", "DLF", "tree", or "nothing"
    };
    std::string file;
    std::optional<std::string> timestamp, description;
    std::vector<Entry> entries;
};

/// A snapshot that the save screen wrote.
class Snapshot {
public:
    /// What can be read of a snapshot whose property list is damaged: its raw records. Null when there are none.
    static Value salvaged(Bytes xml);

    /// Throws std::runtime_error when the property list is no snapshot. Whatever else is wrong with it is reported.
    Snapshot(std::string file, const Value& propertyList, CaptureReader::OnFault onFault);

    const SnapshotListing& listing() const { return _listing; }
    /// The DLF stream as it was written; nothing when there is none.
    const std::optional<Data>& dlf() const { return _dlf; }
    /// The version report that opens it; empty when none does.
    Bytes versionReport() const;

    /// Gives every channel message that can be recovered, in order: from the intervals' raw records, which are whole,
    /// or, where those are missing, from the DLF stream; the trees of an IFX modem serialised anew.
    void recover(PropertyLists& lists, const std::function<void(Bytes)>& take) const;

private:
    void read(Bytes bytes, std::uint64_t from, RecordReader::Origin origin, const std::string& place,
              const std::function<void(Bytes)>& take) const;

    SnapshotListing _listing;
    std::vector<std::pair<std::size_t, Data>> _intervals; ///< with the index of the entry
    std::vector<Value> _trees;
    std::optional<Data> _dlf;
    std::size_t _dlfEntry = 0;
    CaptureReader::OnFault _onFault;
};

} // namespace kestrum::tools
