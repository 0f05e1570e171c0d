#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>

namespace kestrum {

inline constexpr std::size_t kDlfVersionReportSize = 161; ///< bytes

/// Packs the time of writing: seconds since 1970-01-01 UTC in bits 0 to 31, the zone's minutes east of UTC in bits 32
/// to 47, daylight saving (0 or 1) in bits 48 to 55.
constexpr std::uint64_t packDlfTime(std::uint32_t seconds, std::int16_t zoneMinutes, bool daylightSaving)
{
    return seconds | std::uint64_t{static_cast<std::uint16_t>(zoneMinutes)} << 32 |
           std::uint64_t{daylightSaving ? 1u : 0u} << 48;
}

/// Writes the record that opens a DLF stream: program, version and time of writing. A text longer than its field is
/// cut; a NUL always ends it. Returns 0; or 3, with nothing written and `written` 0, when `capacity` is below 161.
int QrelDLFAddVersionReport(std::byte* output, std::uint32_t capacity, std::uint32_t& written,
                            std::uint16_t firstReport, std::uint16_t secondReport, std::string_view version,
                            std::string_view executable, std::string_view build, std::uint64_t packedTime);

} // namespace kestrum
