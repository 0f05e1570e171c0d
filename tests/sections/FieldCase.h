#pragma once

#include "sections/RecordBuilder.h"

#include <cstddef>
#include <cstdint>
#include <ostream>

namespace kestrum {

/// A raw value in bits `first` to `last` of the word of `width` bytes at `offset`, and the text that shows it.
struct FieldCase {
    const char* name;
    std::size_t offset;
    unsigned width, first, last;
    std::uint32_t raw;
    const char* key;
    const char* text;

    /// The word with the raw value in its bits. All other bits are 0 or 1; decoders must ignore them.
    RecordBuilder in(RecordBuilder record, bool amidOnes) const
    {
        const std::uint32_t mask = (0xFFFF'FFFFu >> (31 - (last - first))) << first;
        const std::uint32_t word = (raw << first) | (amidOnes ? ~mask : 0);
        for (unsigned i = 0; i < width; ++i)
            record.u8(offset + i, (word >> (8 * i)) & 0xFF);
        return record;
    }

    friend void PrintTo(const FieldCase& shown, std::ostream* out) { *out << shown.name; }
};

} // namespace kestrum
