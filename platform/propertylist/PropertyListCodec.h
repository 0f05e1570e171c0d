#pragma once

#include "platform/PropertyLists.h"
#include "platform/propertylist/WholeFile.h"

#include <cstddef>
#include <string>

namespace kestrum {

/// Property lists in XML (in and out) and in the binary form "bplist00" (in). Input is held to be hostile: it can be
/// refused, but it cannot crash the reader, nor cost more time or memory than its length allows.
///
/// A list that is damaged anywhere is refused as a whole, and no number is bent to fit: integers are those from -2^63
/// to 2^64-1, dates lie in the years 0 to 9999. A key that comes twice keeps its first place and its last value.
class PropertyListCodec final : public PropertyLists {
public:
    /// Arrays and dictionaries inside each other. Few enough that recursion over a list which was read is safe.
    static constexpr std::size_t kMaxDepth = 512;
    /// Values in a list, those inside each other counted singly, shared ones as often as they occur.
    static constexpr std::size_t kMaxNodes = std::size_t{1} << 20;
    /// Bytes of a serialised list, and of all its texts and data.
    static constexpr std::size_t kMaxBytes = std::size_t{256} << 20;

    /// `maxBytes`: of a serialised list, the same for all that is read and all that is written into files.
    explicit PropertyListCodec(std::size_t maxBytes = kMaxBytes) : _maxBytes(maxBytes) {}

    /// Null for what is no property list, as `parseWithError`.
    Value parse(Bytes bytes) override;
    Value parseOver(Bytes bytes, Value spent) override;

    /// Also nothing for a date outside the years 0 to 9999, and beyond the limits above, which a list that contains
    /// itself exceeds. Fractions of a second are cut off.
    std::optional<Data> toXml(const Value& value) const override;

    Value load(const std::string& path) const override;
    /// Fails also for a file of more bytes than could be read again.
    Stored write(const Dictionary& dictionary, const std::string& path) const override;

    /// What `parseWithError` found: a value, or why there is none.
    struct Parsed {
        Value value;             ///< null when the bytes are no property list
        std::string reason = {}; ///< then why, in a few words; else empty
        std::size_t offset = 0;  ///< then where in the bytes

        explicit operator bool() const { return reason.empty(); }
    };
    Parsed parseWithError(Bytes bytes, Value spent = {}) const;

private:
    std::size_t _maxBytes;
    mutable WholeFile::Identity _lastWritten;
};

} // namespace kestrum
