#include "LogGenerator/UTRAN/UTRANClassIndex.h"
#include "LogGenerator/UTRAN/UTRANLogGenerator.h"

#include "sections/SectionContracts.h"

namespace kestrum {

using Kind = Value::Kind;

const TechnologyContract& technology()
{
    // clang-format off
    static const auto kTechnology = TechnologyContract::of<UTRANClassIndex, UTRANLogGenerator>("UTRAN", 700, {
        // Its records are shown at any length.
        {"RRC_State", "RRC Info", Kind::Dictionary, "RRC Info", {{0xD0E0}}, {"State"}, {}, false},
        {"UTRANServingCellInfo", "Serving Cell Info", Kind::Dictionary, "Serving Cell Info", {{0xD0E2, 26}, {0xFF0001}},
         {"Cell Access Restrictions", "Cell ID", "Downlink UARFCN", "Uplink UARFCN", "URA ID", "Allowed Access",
          "Local Area Code", "Freq Band Indicator", "Cell Scrambling Code"}, {}, false},
        {"UTRANNeighbhorMeasurements", "Neighbor Cell List", Kind::Array, "NeighbhorMeasurements List", {{0xD00A, 21}},
         {"UARFCN", "Cell ID", "Filter RSCP", "Status", "inJDCS"}, {}, false},
        {"GSMNeighbhorMeasurements", "GSM Neighbor Cell List", Kind::Array, "GSM Neighbor Cell List", {{0xD00E, 17}},
         {}, {}, false},
        {"TRCHBLERMeasurement", "TRCH BLER", Kind::Array, "TRCH BLER Measurement", {{0xD00C, 17}},
         {"TRCH ID", "TRCH BLER Measurement"}, {}, false, Priority::Notice, false, 2},
        {"CCTRCHSIRMeasurement", "CCTRCH SIR", Kind::Array, "CCTRCH SIR Measurement", {{0xD00C, 17}},
         {"CCTRCH ID", "TSNUM", "SIR"}, {}, false},
        kPdpContextList,
        kSimInfo,
    });
    // clang-format on
    return kTechnology;
}

} // namespace kestrum
