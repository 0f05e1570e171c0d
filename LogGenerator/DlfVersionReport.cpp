#include "LogGenerator/DlfVersionReport.h"

#include <algorithm>
#include <cstring>
#include <span>

namespace kestrum {
namespace {

constexpr int kSuccess = 0, kTooSmall = 3;
constexpr std::uint16_t kVersionReportCode = 0x1FFD;

/// Little-endian fields and texts at fixed places of the report.
class Report {
public:
    explicit Report(std::span<std::byte> bytes) : _bytes(bytes) { std::ranges::fill(_bytes, std::byte{0}); }

    void number(std::size_t offset, std::size_t width, std::uint64_t value)
    {
        for (std::size_t i = 0; i < width; ++i, value >>= 8)
            _bytes[offset + i] = static_cast<std::byte>(value);
    }
    void text(std::size_t offset, std::size_t width, std::string_view text)
    {
        std::memcpy(&_bytes[offset], text.data(), std::min(text.size(), width - 1));
    }

private:
    std::span<std::byte> _bytes;
};

} // namespace

int QrelDLFAddVersionReport(std::byte* output, std::uint32_t capacity, std::uint32_t& written,
                            std::uint16_t firstReport, std::uint16_t secondReport, std::string_view version,
                            std::string_view executable, std::string_view build, std::uint64_t packedTime)
{
    written = 0;
    if (capacity < kDlfVersionReportSize)
        return kTooSmall;
    // What is not named, time stamp included, is 0.
    Report report(std::span(output, kDlfVersionReportSize));
    report.number(0, 2, kDlfVersionReportSize);
    report.number(2, 2, kVersionReportCode);
    report.number(12, 2, firstReport);
    report.number(14, 2, secondReport);
    report.text(16, 7, version);
    report.text(23, 16, executable);
    report.text(63, 18, build);
    report.number(81, 4, packedTime);
    report.number(85, 2, packedTime >> 32);
    report.number(87, 2, packedTime >> 48 & 0xFF);
    written = kDlfVersionReportSize;
    return kSuccess;
}

} // namespace kestrum
