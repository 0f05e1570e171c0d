#pragma once

#include "support/Bytes.h"
#include "support/Record.h"
#include "support/Value.h"

#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

namespace kestrum {

/// A log record for a test: a complete header, then zeros and the fields that the test sets. Offsets count from the
/// record's first byte. A field beyond the length is an error in the test and throws.
class RecordBuilder {
public:
    static constexpr std::size_t kHeaderSize = 13;

    /// A code of 0xFF0000 or above makes an extra-code record.
    RecordBuilder(LogCode code, std::size_t length) : _code(code), _bytes(length)
    {
        if (length < kHeaderSize)
            throw std::out_of_range("a record begins with 13 header bytes");
        put(0, 1, code >= 0xFF0000 ? 0xFF : 1);
        put(1, 2, static_cast<std::int64_t>(length));
        put(3, 2, code & 0xFFFF);
    }

    RecordBuilder& u8(std::size_t offset, std::int64_t value) { return put(offset, 1, value); }
    RecordBuilder& u16(std::size_t offset, std::int64_t value) { return put(offset, 2, value); }
    RecordBuilder& u32(std::size_t offset, std::int64_t value) { return put(offset, 4, value); }
    RecordBuilder& bytes(std::size_t offset, std::initializer_list<unsigned> values)
    {
        for (const unsigned value : values)
            u8(offset++, value);
        return *this;
    }
    /// Sets every byte from `offset` on.
    RecordBuilder& fill(std::size_t offset, unsigned value)
    {
        for (; offset < _bytes.size(); ++offset)
            u8(offset, value);
        return *this;
    }
    /// Cuts the record off, or appends zeros. The header stays unchanged.
    RecordBuilder& length(std::size_t length)
    {
        _bytes.resize(length);
        return *this;
    }

    /// Appends a marker that `MemoryPropertyLists` reads as a property list once the test has added it there.
    RecordBuilder& propertyList(Value list)
    {
        const auto text = describe(list);
        const auto payload = bytesOf(text);
        _bytes.insert(_bytes.end(), payload.begin(), payload.end());
        _propertyList = std::move(list);
        return *this;
    }

    LogCode code() const { return _code; }
    Bytes bytes() const { return _bytes; }
    const Value& propertyList() const { return _propertyList; }

private:
    RecordBuilder& put(std::size_t offset, std::size_t width, std::int64_t value)
    {
        if (offset > _bytes.size() || width > _bytes.size() - offset)
            throw std::out_of_range("a field beyond the end of the test's record");
        for (std::size_t i = 0; i < width; ++i)
            _bytes[offset + i] = static_cast<std::byte>(value >> (8 * i));
        return *this;
    }

    LogCode _code;
    std::vector<std::byte> _bytes;
    Value _propertyList;
};

inline RecordBuilder record(LogCode code, std::size_t length)
{
    return {code, length};
}

/// A record of the telephony service: a property list after the header.
inline RecordBuilder propertyListRecord(LogCode code, Value list)
{
    return record(code, RecordBuilder::kHeaderSize).propertyList(std::move(list));
}

/// A cell of the telephony service's cell monitor: "GSM", "UMTS", "LTE", "UTRAN2" or "CDMA"; "Serving" or "Neighbor";
/// and its numbers by key.
inline Value cell(const std::string& technology, const std::string& type,
                  std::initializer_list<Dictionary::Entry> numbers = {})
{
    auto made = makeDictionary(numbers);
    made->set("kVoxCell_Technology", "kVoxCellTechnology_" + technology);
    made->set("kVoxCell_Type", "kVoxCellType_" + type);
    return made;
}

inline RecordBuilder cellMonitor(std::vector<Value> cells)
{
    return propertyListRecord(0xFF0001, makeArray(std::move(cells)));
}

} // namespace kestrum
