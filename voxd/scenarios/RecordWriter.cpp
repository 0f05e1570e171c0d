#include "voxd/scenarios/RecordWriter.h"

#include "platform/ChannelMessage.h"

#include <algorithm>
#include <cmath>

namespace kestrum {
namespace {

constexpr Field kType = u8(0), kLength = u16(1), kCode = u16(3);
constexpr std::size_t kTimeStamp = 5;
constexpr std::byte kPrefix[] = {std::byte{0x81}, std::byte{0}};

} // namespace

RecordWriter::RecordWriter(LogCode code, std::size_t length) : _bytes(length)
{
    set(kType, code >= ChannelMessage::kExtraCodes ? 0xFF : 1);
    // The length without the type byte, which a record in a log file does not have.
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
    FieldWriter(_bytes).set64(kTimeStamp, timeStampFromDate(at) & ~kSubdivision);
    if (prefixed)
        _bytes.insert(_bytes.begin(), std::begin(kPrefix), std::end(kPrefix));
    return std::move(_bytes);
}

std::int64_t quantized(double value, double lowest, double step, Field field)
{
    const auto highest = std::exp2(field.last - field.first + 1) - 1;
    return std::llround(std::clamp((value - lowest) / step, 0.0, highest));
}

} // namespace kestrum
