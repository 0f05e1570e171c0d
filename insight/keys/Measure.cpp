#include "insight/keys/Measure.h"

namespace kestrum {

std::span<const MeasureTraits> measures()
{
    // clang-format off
    static constexpr MeasureTraits kMeasures[] = {
        {Measure::Rsrp,                  "RSRP",    "dBm", -160,   0},
        {Measure::Rsrq,                  "RSRQ",    "dB",   -40,  10},
        {Measure::Srxlev,                "Srxlev",  "dBm", -140, 140}, // a ratio, but displays show it in dBm
        {Measure::Sinr,                  "SINR",    "dB",   -40,  60},
        {Measure::Rscp,                  "RSCP",    "dBm", -140,   0},
        {Measure::EcNo,                  "Ec/No",   "dB",   -40,  10},
        {Measure::RxLev,                 "RxLev",   "dBm", -120,   0},
        {Measure::RxQual,                "RxQual",  "",       0,   7, true},
        {Measure::PilotStrength,         "Ec/Io",   "dB",   -50,  10},
        {Measure::CarrierToInterference, "C/I",     "dB",   -50,  40},
        {Measure::CdmaPower,             "RxAGC",   "dBm", -120,   0},
        {Measure::FrameErrors,           "FER",     "%",      0, 100, true},
    };
    // clang-format on
    return kMeasures;
}

} // namespace kestrum
