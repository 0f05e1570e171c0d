#pragma once

#include "support/Bytes.h"
#include "support/Value.h"

#include <optional>
#include <string>
#include <string_view>

namespace kestrum {

/// Property lists: the serialised form of values that travels to and from the telephony service.
class PropertyLists {
public:
    virtual ~PropertyLists() = default;

    /// Any form (XML or binary), told apart by the bytes. Null for anything that is no property list; nothing that
    /// the bytes hold can crash, hang or exhaust memory.
    virtual Value parse(Bytes bytes) = 0;
    /// Like `parse`, but may reuse the memory of `spent`: pass a value that is no longer read. Containers that are
    /// shared stay as they are.
    virtual Value parseOver(Bytes bytes, Value spent) = 0;

    /// The XML form, version 1.0. Nulls are left out, characters that XML forbids become U+FFFD.
    /// Nothing when the value is null or nested too deeply.
    virtual std::optional<Data> toXml(const Value& value) const = 0;

    /// The property list in a file; null when it cannot be read or parsed.
    virtual Value load(const std::string& path) const = 0;

    enum class Stored { Written, NameTaken, Failed };
    /// Writes a dictionary in XML form into a file of its own, for the user's eyes alone, whole or not at all. A missing
    /// directory is created. The same path again replaces what these lists wrote there; anything else that stands
    /// there stays as it is.
    virtual Stored write(const Dictionary& dictionary, const std::string& path) const = 0;
};

} // namespace kestrum
