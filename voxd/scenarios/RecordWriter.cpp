#include "voxd/scenarios/RecordWriter.h"

#include <algorithm>
#include <cmath>
#include <stdexcept>

namespace kestrum {
namespace {

constexpr LogCode kExtraCodes = 0xFF0000;
constexpr Field kType = u8(0), kLength = u16(1), kCode = u16(3), kTimeStamp = u32(5), kTimeStampUpper = u32(9);
constexpr std::byte kPrefix[] = {std::byte{0x81}, std::byte{0}};

std::uint32_t maskOf(unsigned bits)
{
    return 0xFFFF'FFFFu >> (32 - bits);
}

} // namespace

RecordPart& RecordPart::set(Field field, std::int64_t value)
{
    const unsigned bits = field.last - field.first + 1;
    if (value < -(std::int64_t{1} << (bits - 1)) || value > std::int64_t{maskOf(bits)})
        throw std::out_of_range("a number too large for its field");
    const auto word = part(field.offset, field.width)._bytes;
    const std::uint32_t changed = maskOf(bits) << field.first;
    const std::uint32_t put = (static_cast<std::uint32_t>(value) & maskOf(bits)) << field.first;
    for (unsigned i = 0; i < field.width; ++i) {
        auto& byte = word[field.bigEndian ? field.width - 1 - i : i];
        byte = (byte & ~static_cast<std::byte>(changed >> (8 * i))) | static_cast<std::byte>(put >> (8 * i));
    }
    return *this;
}

RecordPart RecordPart::part(std::size_t offset, std::size_t length) const
{
    if (offset > _bytes.size() || length > _bytes.size() - offset)
        throw std::out_of_range("a field beyond the end of its record");
    return RecordPart(_bytes.subspan(offset, length));
}

RecordWriter::RecordWriter(LogCode code, std::size_t length) : _bytes(length)
{
    set(kType, code >= kExtraCodes ? 0xFF : 1);
    // Counted as in a log file, where the record has no type byte.
    set(kLength, static_cast<std::int64_t>(length) - 1);
    set(kCode, code & 0xFFFF);
}

RecordWriter::RecordWriter(LogCode code, Bytes payload) : RecordWriter(code, kHeaderSize + payload.size())
{
    std::ranges::copy(payload, _bytes.begin() + kHeaderSize);
}

std::vector<std::byte> RecordWriter::message(Date at, bool prefixed) &&
{
    constexpr std::uint64_t kSubdivision = 0xFFFF;
    const std::uint64_t stamp = timeStampFromDate(at) & ~kSubdivision;
    set(kTimeStamp, static_cast<std::uint32_t>(stamp));
    set(kTimeStampUpper, static_cast<std::uint32_t>(stamp >> 32));
    if (prefixed)
        _bytes.insert(_bytes.begin(), std::begin(kPrefix), std::end(kPrefix));
    return std::move(_bytes);
}

std::int64_t quantized(double value, double lowest, double step, Field field)
{
    const auto highest = static_cast<double>(maskOf(field.last - field.first + 1));
    return std::llround(std::clamp((value - lowest) / step, 0.0, highest));
}

} // namespace kestrum
