#pragma once

#include "support/Date.h"
#include "support/Record.h"

#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

namespace kestrum {

/// A part of a record that is being written: offsets of its fields count from its own first byte. Owns nothing.
class RecordPart {
public:
    explicit RecordPart(std::span<std::byte> bytes) : _bytes(bytes) {}

    /// Puts a number, signed or not, into the field's bits and leaves the other bits of its word as they are. A number
    /// that the bits cannot hold, or a field beyond the part, is a mistake in the scenario and throws.
    RecordPart& set(Field field, std::int64_t value);

    /// The `length` bytes at `offset`.
    RecordPart part(std::size_t offset, std::size_t length) const;

private:
    std::span<std::byte> _bytes;
};

/// A log record in the making: offsets count from the record's first byte, header included, as those who read it count.
/// What is not set is 0.
class RecordWriter {
public:
    static constexpr std::size_t kHeaderSize = 13;

    /// `length` counts the header. A code of 0xFF0000 or above makes a record of the telephony service.
    RecordWriter(LogCode code, std::size_t length);
    /// A record of the telephony service: a serialised property list behind the header.
    RecordWriter(LogCode code, Bytes payload);

    RecordWriter& set(Field field, std::int64_t value)
    {
        RecordPart(_bytes).set(field, value);
        return *this;
    }
    RecordPart part(std::size_t offset, std::size_t length) { return RecordPart(_bytes).part(offset, length); }

    /// The finished channel message, stamped with `at`; some modems put a 2-byte prefix before the record.
    std::vector<std::byte> message(Date at, bool prefixed) &&;

private:
    std::vector<std::byte> _bytes;
};

/// A measured quantity as the raw number of a field: steps of `step` above `lowest`. It saturates at the field's ends.
std::int64_t quantized(double value, double lowest, double step, Field field);

} // namespace kestrum
