#pragma once

#include "platform/PropertyLists.h"
#include "platform/posix/WholeFile.h"

#include <cstddef>
#include <string>

namespace kestrum {

/// Reads property lists in XML and in the binary form "bplist00"; writes XML. Input may be hostile: the reader does not
/// crash, and time and memory stay proportional to the input's length.
///
/// A list with any damage is refused as a whole. Integers are -2^63 to 2^64-1, dates lie in the years 0 to 9999; other
/// numbers are refused, not rounded. A key that occurs twice keeps its first place and its last value.
class PropertyListCodec final : public PropertyLists {
public:
    /// Nested arrays and dictionaries. Recursion over a list of this depth is safe.
    static constexpr std::size_t kMaxDepth = 512;
    /// Values in a list, containers included; shared values count as often as they occur.
    static constexpr std::size_t kMaxNodes = std::size_t{1} << 20;
    /// Bytes of a serialised list, and of all its texts and data.
    static constexpr std::size_t kMaxBytes = std::size_t{256} << 20;

    /// `maxBytes`: the limit of a serialised list that is read, or written to a file.
    explicit PropertyListCodec(std::size_t maxBytes = kMaxBytes) : _maxBytes(maxBytes) {}

    /// Like `parseWithError`, without the reason.
    Value parse(Bytes bytes) override;
    Value parseOver(Bytes bytes, Value spent) override;

    /// Nothing also for a date outside the years 0 to 9999, and for a value beyond the limits above, such as a
    /// container that contains itself. Fractions of a second are cut off.
    std::optional<Data> toXml(const Value& value) const override;

    Value load(const std::string& path) const override;
    /// Fails also when the file would exceed `maxBytes`, which could not be read again.
    Stored write(const Dictionary& dictionary, const std::string& path) const override;

    /// The result of `parseWithError`: a value, or the reason of the refusal.
    struct Parsed {
        Value value;             ///< null when the bytes were refused
        std::string reason = {}; ///< why they were refused; empty when they were not
        std::size_t offset = 0;  ///< the place of the fault, in bytes

        explicit operator bool() const { return reason.empty(); }
    };
    Parsed parseWithError(Bytes bytes, Value spent = {}) const;

private:
    std::size_t _maxBytes;
    mutable WholeFile::Identity _lastWritten;
};

} // namespace kestrum
