#pragma once

#include "platform/Stored.h"
#include "support/Bytes.h"
#include "support/Value.h"

#include <optional>
#include <string>
#include <string_view>

namespace kestrum {

/// Property lists: values in serialised form, as messages of the telephony service and files hold them.
class PropertyLists {
public:
    virtual ~PropertyLists() = default;

    /// Reads the XML or the binary form, recognised by its bytes. Null when the bytes are no property list. No bytes
    /// can crash the reader, block it or exhaust memory.
    virtual Value parse(Bytes bytes) = 0;
    /// Like `parse`, but may reuse the memory of `spent`: pass a value that is no longer read. Containers that another
    /// value shares do not change.
    virtual Value parseOver(Bytes bytes, Value spent) = 0;

    /// The XML form (XML 1.0). Nulls are left out; characters that XML forbids become U+FFFD.
    /// Nothing when the value is null or nested too deeply.
    virtual std::optional<Data> toXml(const Value& value) const = 0;

    /// The property list in a file; null when it cannot be read or parsed.
    virtual Value load(const std::string& path) const = 0;

    using Stored = kestrum::Stored;
    /// Writes a dictionary in XML form to a file that only the user can read. The file is complete or does not exist.
    /// Creates a missing directory. Replaces only the file that the last call wrote; for any other file at the path the
    /// result is NameTaken.
    virtual Stored write(const Dictionary& dictionary, const std::string& path) const = 0;
};

} // namespace kestrum
