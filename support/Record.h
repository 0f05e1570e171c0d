#pragma once

#include "support/Bytes.h"

#include <cstddef>
#include <cstdint>
#include <optional>

namespace kestrum {

/// A modem log code: the record's 16-bit code, plus 0xFF0000 for the telephony service's extra codes.
using LogCode = std::uint32_t;

/// Bits `first` to `last` (0 is the least significant) of the word of `width` bytes at `offset`. Offsets count from the
/// record's first byte, header included. Little-endian unless `bigEndian`.
struct Field {
    std::size_t offset;
    unsigned width;
    unsigned first = 0;
    unsigned last = 8 * width - 1;
    bool bigEndian = false;

    consteval Field bits(unsigned from, unsigned to) const
    {
        if (from > to || to >= 8 * width)
            throw "no such bits in this word";
        return {offset, width, from, to, bigEndian};
    }
    consteval Field bit(unsigned which) const { return bits(which, which); }

    /// The offset behind the field's word.
    constexpr std::size_t end() const { return offset + width; }
};

consteval Field u8(std::size_t offset)
{
    return {offset, 1};
}
consteval Field u16(std::size_t offset)
{
    return {offset, 2};
}
consteval Field u32(std::size_t offset)
{
    return {offset, 4};
}
consteval Field u16BigEndian(std::size_t offset)
{
    return {offset, 2, 0, 15, true};
}

/// A view of one record. Owns nothing: the bytes must outlive it.
class Record {
public:
    explicit Record(Bytes bytes) : _bytes(bytes) {}

    std::size_t size() const { return _bytes.size(); }
    Bytes bytes() const { return _bytes; }

    /// The `length` bytes from `offset`; nothing unless all of them are there.
    std::optional<Record> slice(std::size_t offset, std::size_t length) const
    {
        // offset + length could wrap; this difference cannot.
        if (offset > size() || length > size() - offset)
            return std::nullopt;
        return Record(_bytes.subspan(offset, length));
    }

    /// All bytes from `offset`; nothing when it lies beyond the end.
    std::optional<Record> from(std::size_t offset) const
    {
        return offset > size() ? std::nullopt : slice(offset, size() - offset);
    }

    /// The field, unsigned; nothing unless its whole word is there.
    std::optional<std::uint32_t> read(Field field) const
    {
        const auto part = slice(field.offset, field.width);
        if (!part)
            return std::nullopt;
        const auto byte = [&](std::size_t at) { return std::to_integer<std::uint32_t>(part->_bytes[at]); };
        std::uint32_t word = 0;
        if (field.bigEndian)
            for (std::size_t at = 0; at < field.width; ++at)
                word = (word << 8) | byte(at);
        else if (field.width == 4) // each expression compiles to a single load
            word = byte(0) | (byte(1) << 8) | (byte(2) << 16) | (byte(3) << 24);
        else if (field.width == 2)
            word = byte(0) | (byte(1) << 8);
        else
            word = byte(0);
        return (word >> field.first) & (0xFFFF'FFFFu >> (31 - (field.last - field.first)));
    }

    /// The little-endian 64-bit number at `offset`; nothing unless all of it is there.
    std::optional<std::uint64_t> read64(std::size_t offset) const
    {
        const auto part = slice(offset, 8);
        if (!part)
            return std::nullopt;
        return std::uint64_t{*part->read(u32(4))} << 32 | *part->read(u32(0));
    }

private:
    Bytes _bytes;
};

} // namespace kestrum
