#pragma once

#include "support/Record.h"

#include <cstddef>
#include <cstdint>
#include <span>
#include <stdexcept>

namespace kestrum {

/// Writes fields into a record, at the places where Record reads them. Owns nothing: the bytes must outlive it.
class FieldWriter {
public:
    explicit FieldWriter(std::span<std::byte> bytes) : _bytes(bytes) {}

    /// Writes a number, signed or unsigned, into the field's bits; the other bits of the word keep their values. Throws
    /// std::out_of_range for a number that does not fit the bits and for a field beyond the end.
    FieldWriter& set(Field field, std::int64_t value)
    {
        const unsigned bits = field.last - field.first + 1;
        const std::uint32_t mask = 0xFFFF'FFFFu >> (32 - bits);
        if (value < -(std::int64_t{1} << (bits - 1)) || value > std::int64_t{mask})
            throw std::out_of_range("a number too large for its field");
        const auto word = part(field.offset, field.width)._bytes;
        const std::uint32_t replaced = mask << field.first;
        const std::uint32_t number = (static_cast<std::uint32_t>(value) & mask) << field.first;
        for (unsigned i = 0; i < field.width; ++i) {
            auto& byte = word[field.bigEndian ? field.width - 1 - i : i];
            byte = (byte & ~static_cast<std::byte>(replaced >> (8 * i))) | static_cast<std::byte>(number >> (8 * i));
        }
        return *this;
    }

    /// Writes a 64-bit number at `offset`, little-endian. Throws std::out_of_range beyond the end.
    FieldWriter& set64(std::size_t offset, std::uint64_t value)
    {
        const FieldWriter word = part(offset, 8);
        FieldWriter(word._bytes).set(u32(0), static_cast<std::uint32_t>(value));
        FieldWriter(word._bytes).set(u32(4), static_cast<std::uint32_t>(value >> 32));
        return *this;
    }

    /// Writes to the `length` bytes at `offset`; offsets count from there. Throws std::out_of_range beyond the end.
    FieldWriter part(std::size_t offset, std::size_t length) const
    {
        // offset + length could wrap; this difference cannot.
        if (offset > _bytes.size() || length > _bytes.size() - offset)
            throw std::out_of_range("a field beyond the end of its record");
        return FieldWriter(_bytes.subspan(offset, length));
    }

private:
    std::span<std::byte> _bytes;
};

} // namespace kestrum
