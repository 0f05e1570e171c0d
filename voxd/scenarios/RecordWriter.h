#pragma once

#include "support/Date.h"
#include "support/FieldWriter.h"
#include "support/Record.h"

#include <cstddef>
#include <cstdint>
#include <vector>

namespace kestrum {

/// Builds a log record. Offsets count from the record's first byte, header included. Fields that are not set are 0.
class RecordWriter {
public:
    static constexpr std::size_t kHeaderSize = 13;

    /// `length` includes the header. The fields' numbers and offsets are checked, see FieldWriter::set. A code of
    /// 0xFF0000 or above makes a record of the telephony service.
    RecordWriter(LogCode code, std::size_t length);
    /// A record of the telephony service: a serialised property list after the header.
    RecordWriter(LogCode code, Bytes payload);

    RecordWriter& set(Field field, std::int64_t value)
    {
        FieldWriter(_bytes).set(field, value);
        return *this;
    }
    FieldWriter part(std::size_t offset, std::size_t length) { return FieldWriter(_bytes).part(offset, length); }

    /// The finished channel message with the time stamp `at`. Some modems put a prefix of 2 bytes before the record.
    std::vector<std::byte> message(Date at, bool prefixed) &&;

private:
    std::vector<std::byte> _bytes;
};

/// The raw number of a measured quantity: steps of `step` above `lowest`, limited to the field's range.
std::int64_t quantized(double value, double lowest, double step, Field field);

} // namespace kestrum
