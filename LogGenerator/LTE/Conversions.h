#pragma once

#include "support/Format.h"

#include <cstdint>
#include <string>

namespace kestrum {

// What a raw value measures. The ranges begin where the reporting ranges of 3GPP TS 36.133 and TS 36.331 do, or below.
inline double rsrpQuarterDb(std::uint32_t raw)
{
    return raw * 0.25 - 140.0;
}
inline double rsrqEighthDb(std::uint32_t raw)
{
    return raw * 0.125 - 20.0;
}
inline double rsrqQuarterDb(std::uint32_t raw)
{
    return raw * 0.25 - 30.0;
}
/// RSSI; and RSRP where a record has room for half-dB steps only.
inline double powerHalfDb(std::uint32_t raw)
{
    return raw * 0.5 - 140.0;
}
inline int srxlev(std::uint32_t raw)
{
    return static_cast<int>(raw) - 30;
}
/// The least level that cell selection accepts, sent in steps of 2 dB.
inline int qrxlevmin(std::uint32_t raw)
{
    return 2 * static_cast<int>(raw) - 140;
}

// How it is worded.
template <double (*Quantity)(std::uint32_t)>
std::string inDbm(std::uint32_t raw)
{
    return formatted("%4.2f dBm", Quantity(raw));
}
template <double (*Quantity)(std::uint32_t)>
std::string inDb(std::uint32_t raw)
{
    return formatted("%4.2f dB", Quantity(raw));
}
template <int (*Quantity)(std::uint32_t)>
std::string inWholeDbm(std::uint32_t raw)
{
    return formatted("%d dBm", Quantity(raw));
}

} // namespace kestrum
