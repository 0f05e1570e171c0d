#include "voxd/capture/Capture.h"

#include "support/Format.h"
#include "support/Record.h"

#include <algorithm>
#include <array>

namespace kestrum {
namespace {

constexpr std::size_t kKcapLength = 4, kDlfLength = 2, kDlfHeader = 12;
constexpr std::byte kOrdinaryRecord{1};
constexpr std::size_t kChunk = 64 << 10;

void write(std::ostream& to, std::uint64_t number, std::size_t width)
{
    for (std::size_t i = 0; i < width; ++i)
        to.put(static_cast<char>(number >> (8 * i)));
}

} // namespace

std::optional<CaptureFormat> captureFormat(std::string_view path)
{
    if (path.ends_with(".kcap"))
        return CaptureFormat::Kcap;
    if (path.ends_with(".dlf"))
        return CaptureFormat::Dlf;
    return std::nullopt;
}

std::optional<std::vector<std::byte>> CaptureReader::next()
{
    if (!_fault.empty())
        return std::nullopt;
    std::array<std::byte, kKcapLength> bytes{};
    const std::size_t width = _format == CaptureFormat::Kcap ? kKcapLength : kDlfLength;
    std::size_t got = readLength(bytes, width);
    while (_format == CaptureFormat::Kcap && got == width && Record(bytes).read(u32(0)) == kKcapGap) {
        if (!take(kKcapGapSize - kKcapLength, {}))
            return std::nullopt;
        _offset += kKcapGapSize;
        got = readLength(bytes, width);
    }
    if (got == 0)
        return std::nullopt;
    const Record length(Bytes(bytes).first(got));
    if (_format == CaptureFormat::Kcap) {
        const auto count = length.read(u32(0));
        if (!count)
            _fault = formatted("the length has only %lu of its 4 bytes", got);
        else if (*count > kMaximumMessage)
            _fault = formatted("a message of %u bytes, allowed are %lu", *count, kMaximumMessage);
        else if (auto message = take(*count, {})) {
            _offset += kKcapLength + *count;
            return message;
        }
        return std::nullopt;
    }
    const auto count = length.read(u16(0));
    if (!count)
        _fault = "the length has only 1 of its 2 bytes";
    else if (*count < kDlfHeader)
        _fault = formatted("a record of %u bytes, less than its header's %lu", *count, kDlfHeader);
    else if (auto message = take(*count - kDlfLength, {kOrdinaryRecord, bytes[0], bytes[1]})) {
        _offset += *count;
        return message;
    }
    return std::nullopt;
}

std::size_t CaptureReader::readLength(std::span<std::byte> into, std::size_t width)
{
    _from->read(reinterpret_cast<char*>(into.data()), static_cast<std::streamsize>(width));
    return static_cast<std::size_t>(_from->gcount());
}

// In pieces: what a damaged length promises need not be there.
std::optional<std::vector<std::byte>> CaptureReader::take(std::size_t length, std::vector<std::byte> into)
{
    const std::size_t wanted = into.size() + length;
    while (into.size() < wanted) {
        const std::size_t at = into.size(), piece = std::min(kChunk, wanted - at);
        into.resize(at + piece);
        _from->read(reinterpret_cast<char*>(into.data() + at), static_cast<std::streamsize>(piece));
        if (static_cast<std::size_t>(_from->gcount()) < piece) {
            _fault = formatted("the last message ends %lu bytes short",
                               wanted - at - static_cast<std::size_t>(_from->gcount()));
            return std::nullopt;
        }
    }
    return into;
}

void writeKcapGap(std::ostream& to, std::uint64_t messages)
{
    write(to, kKcapGap, kKcapLength);
    write(to, messages, kKcapGapSize - kKcapLength);
}

std::optional<std::uint64_t> kcapGap(Bytes bytes)
{
    const Record note(bytes);
    const auto low = note.read(u32(4)), high = note.read(u32(8));
    if (note.read(u32(0)) != kKcapGap || !low || !high)
        return std::nullopt;
    return std::uint64_t{*high} << 32 | *low;
}

void writeKcap(std::ostream& to, Bytes message)
{
    write(to, message.size(), kKcapLength);
    to.write(reinterpret_cast<const char*>(message.data()), static_cast<std::streamsize>(message.size()));
}

} // namespace kestrum
