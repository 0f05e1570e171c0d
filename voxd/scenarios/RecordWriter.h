#pragma once

#include "support/Date.h"
#include "support/FieldWriter.h"
#include "support/Record.h"

#include <cstddef>
#include <cstdint>
#include <vector>

namespace kestrum {

/// A log record being written. Offsets count from its first byte, header included. What is not set is 0.
class RecordWriter {
public:
    static constexpr std::size_t kHeaderSize = 13;

    /// `length` counts the header. The fields' numbers and offsets are checked, see FieldWriter::set.
    /// A code of 0xFF0000 or above makes a record of the telephony service.
    RecordWriter(LogCode code, std::size_t length);
    /// A record of the telephony service: a serialised property list behind the header.
    RecordWriter(LogCode code, Bytes payload);

    RecordWriter& set(Field field, std::int64_t value)
    {
        FieldWriter(_bytes).set(field, value);
        return *this;
    }
    FieldWriter part(std::size_t offset, std::size_t length) { return FieldWriter(_bytes).part(offset, length); }

    /// The finished channel message, stamped with `at`; some modems put a 2-byte prefix before the record.
    std::vector<std::byte> message(Date at, bool prefixed) &&;

private:
    std::vector<std::byte> _bytes;
};

/// A measured quantity as the raw number of a field: steps of `step` above `lowest`. It saturates at the field's ends.
std::int64_t quantized(double value, double lowest, double step, Field field);

} // namespace kestrum
