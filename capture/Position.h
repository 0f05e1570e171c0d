#pragma once

#include "support/Date.h"

#include <chrono>
#include <optional>

namespace kestrum {

inline constexpr double kMostLatitude = 90, kMostLongitude = 180; ///< degrees
inline constexpr double kMostSpeed = 10'000;                      ///< metres a second; a satellite's is below 8,000

/// A position counts for less than this time after its report.
inline constexpr std::chrono::seconds kLongestPositionAge{5};

/// A position that a satellite receiver has found. There is no such object without a fix.
struct Position {
    int dimensions;              ///< 2: latitude and longitude are known; 3: the altitude too
    double latitude;             ///< degrees (WGS 84), -90 to 90, north is positive
    double longitude;            ///< degrees (WGS 84), -180 to 180, east is positive
    std::optional<double> speed; ///< metres a second over ground, 0 to kMostSpeed
    std::optional<Date> time;    ///< of the fix, by the satellites

    bool operator==(const Position&) const = default;
};

} // namespace kestrum
