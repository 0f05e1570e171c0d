#pragma once

#include "LogGenerator/Quantities.h"

namespace kestrum {

inline std::string signedDecibels(double ratio)
{
    return formatted("%+.2f dB", ratio);
}
/// A pilot's energy relative to the total received energy (Ec/Io): "-5.25 dB".
inline constexpr Quantity kPilotStrength = computedQuantity<signedDecibels>("dB");

} // namespace kestrum
