#include "LogGenerator/DlfVersionReport.h"

#include "support/Bytes.h"
#include "support/FieldWriter.h"

#include <algorithm>
#include <span>

namespace kestrum {
namespace {

constexpr int kSuccess = 0, kTooSmall = 3;
constexpr std::uint16_t kVersionReportCode = 0x1FFD;

/// Copies a text to a field of `width` zero bytes. A longer text is cut, so that a NUL always ends it.
void put(std::string_view text, std::span<std::byte> report, std::size_t offset, std::size_t width)
{
    std::ranges::copy(bytesOf(text.substr(0, width - 1)), report.subspan(offset, width).begin());
}

} // namespace

int QrelDLFAddVersionReport(std::byte* output, std::uint32_t capacity, std::uint32_t& written,
                            std::uint16_t firstReport, std::uint16_t secondReport, std::string_view version,
                            std::string_view executable, std::string_view build, std::uint64_t packedTime)
{
    written = 0;
    if (capacity < kDlfVersionReportSize)
        return kTooSmall;
    // All other bytes, the time stamp included, are 0.
    const std::span report(output, kDlfVersionReportSize);
    std::ranges::fill(report, std::byte{0});
    FieldWriter(report)
        .set(u16(0), kDlfVersionReportSize)
        .set(u16(2), kVersionReportCode)
        .set(u16(12), firstReport)
        .set(u16(14), secondReport)
        .set(u32(81), static_cast<std::uint32_t>(packedTime))
        .set(u16(85), static_cast<std::uint16_t>(packedTime >> 32))
        .set(u16(87), static_cast<std::uint8_t>(packedTime >> 48));
    put(version, report, 16, 7);
    put(executable, report, 23, 16);
    put(build, report, 63, 18);
    written = kDlfVersionReportSize;
    return kSuccess;
}

} // namespace kestrum
