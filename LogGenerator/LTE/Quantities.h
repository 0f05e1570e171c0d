#pragma once

#include "LogGenerator/Quantities.h"

#include <cstdint>

namespace kestrum {

// Raw values to dB and dBm. The ranges begin at the lower ends of the reporting ranges of 3GPP TS 36.133 and TS 36.331,
// or below.
constexpr double rsrpQuarterDb(std::uint32_t raw)
{
    return raw * 0.25 - 140.0;
}
constexpr double rsrqEighthDb(std::uint32_t raw)
{
    return raw * 0.125 - 20.0;
}
constexpr double rsrqQuarterDb(std::uint32_t raw)
{
    return raw * 0.25 - 30.0;
}
/// RSSI; and RSRP where a record has room for half-dB steps only.
constexpr double powerHalfDb(std::uint32_t raw)
{
    return raw * 0.5 - 140.0;
}
constexpr int srxlev(std::uint32_t raw)
{
    return static_cast<int>(raw) - 30;
}
/// The lowest level for cell selection (3GPP TS 36.304), sent in steps of 2 dB.
constexpr int qrxlevmin(std::uint32_t raw)
{
    return 2 * static_cast<int>(raw) - 140;
}

} // namespace kestrum
