#pragma once

#include <cstdint>
#include <span>
#include <string_view>

namespace kestrum {

/// What is graded ("good", "poor"). Several keys measure the same: the RSRP of the serving cell and of a neighbour.
enum class Measure : std::uint8_t {
    None, ///< not graded
    Rsrp,
    Rsrq,
    Srxlev,
    Sinr,
    Rscp,
    EcNo,
    RxLev,
    RxQual,
    PilotStrength,
    CarrierToInterference,
    CdmaPower,
    FrameErrors,
};

struct MeasureTraits {
    Measure measure;
    std::string_view name; ///< in a file of thresholds
    std::string_view unit;
    double least, greatest; ///< that a threshold can have
    bool lessIsBetter = false;
};

/// All measures except None.
std::span<const MeasureTraits> measures();

} // namespace kestrum
