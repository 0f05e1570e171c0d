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

/// The facts about a snapshot file that it states itself.
struct SnapshotListing {
    struct Entry {
        std::string description;  ///< empty: none
        std::string date;         ///< empty: none
        std::uint64_t size = 0;   ///< of the raw records or the DLF stream: bytes; of a tree: values
        std::string_view content; ///< "records", "DLF", "tree", or "nothing"
    };
    std::string file;
    std::optional<std::string> timestamp, description;
    std::vector<Entry> entries;
};

/// A snapshot from the save screen.
class Snapshot {
public:
    /// The raw records of a snapshot whose property list is damaged. Null when there are none.
    static Value salvaged(Bytes xml);

    /// Throws std::runtime_error when the property list is no snapshot. Other faults are reported.
    Snapshot(std::string file, const Value& propertyList, CaptureReader::OnFault onFault);

    const SnapshotListing& listing() const { return _listing; }
    /// The DLF stream as it was written; empty when there is none.
    const std::optional<Data>& dlf() const { return _dlf; }
    /// The version report at the stream's start; empty when it has none.
    Bytes versionReport() const;

    /// Gives every channel message that can be recovered, in order: from the intervals' raw records, which are
    /// complete, or, where those are missing, from the DLF stream. The trees of an IFX modem are serialised again.
    void recover(PropertyLists& lists, const std::function<void(Bytes)>& take) const;

private:
    void read(Bytes bytes, std::uint64_t from, RecordReader::Origin origin, const std::string& place,
              const std::function<void(Bytes)>& take) const;

    SnapshotListing _listing;
    std::vector<std::pair<std::size_t, Data>> _intervals; ///< with the entry's index
    std::vector<Value> _trees;
    std::optional<Data> _dlf;
    std::size_t _dlfEntry = 0;
    CaptureReader::OnFault _onFault;
};

} // namespace kestrum::tools
