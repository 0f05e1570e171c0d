#include "LogGenerator/LTE/LTEClassIndex.h"
#include "LogGenerator/LTE/LTELogGenerator.h"

#include "sections/SectionContracts.h"

namespace kestrum {

using Kind = Value::Kind;

const TechnologyContract& technology()
{
    // clang-format off
    static const auto kTechnology = TechnologyContract::of<LTEClassIndex, LTELogGenerator>("LTE", 400, {
        {"LTEServingCellInfo", "Serving Cell Info", Kind::Dictionary, "LTE Serving Cell Info",
         {{0xB0C2, 38}, {.code = 0xB0C1, .minimumLength = 22, .reported = true}, {0xFF0001}},
         {"Physical Cell ID", "Download Frequency", "Upload Frequency", "Download Bandwidth", "Upload Bandwidth",
          "Cell Identity", "Tracking Area Code", "Freq Band Indicator", "Num Tx Antennas", "UARFCN"}},
        {"ConnectedModeMeasurementMisc", "Connected mode LTE Intra-frequency Measurement", Kind::Dictionary,
         "Connected mode LTE Intra-frequency Measurement", {{0xB179, 29}},
         {"E-ARFCN", "Serving Physical Cell ID", "Subframe Number", "Serving Filtered RSRP", "Serving Filtered RSRQ"}},
        {"MeasuredNeighborCells", "Measured Neighbor Cells", Kind::Array, "Measured Neighbor Cells", {{0xB179, 29}},
         {"Physical Cell ID", "Filtered RSRP", "Filtered RSRQ"}},
        {"DetectedCells", "Detected Cells", Kind::Array, "Detected Cells", {{0xB179, 29}}, {"Physical Cell ID"}},
        {"ServingCellMeasurement", "Serving Cell Measurements", Kind::Dictionary, "Serving Cell Measurements",
         {{0xB17F, 33}},
         {"Version", "E-ARFCN", "Physical Cell ID", "Serving Layer Priority", "Measured RSRP", "Average RSRP",
          "Measured RSRQ", "Average RSRQ", "Measured RSSI", "Qrxlevmin", "P_Max", "Max UE Tx Power", "Srxlev",
          "Num of Consecutive DRX Cycles of S < 0", "S Intra Search", "S Non Intra Search",
          "Measurement Rules Updated", "Measurement Rules"}},
        {"NeighborMeasurementMisc", "Neighbor Measurements", Kind::Dictionary, "Neighbor Measurements", {{0xB180, 21}},
         {"Version", "E-ARFCN", "Qrxlevmin"}},
        {.className = "NeighborCellsList", .name = "Neighbor Cells List", .kind = Kind::Array,
         .traceLine = "Neighbor Cells List", .codes = {{.code = 0xB180, .minimumLength = 21, .countsFromOne = true}},
         .keys = {"Physical Cell ID", "Measured RSSI", "Measured RSRP", "Average RSRP", "Measured RSRQ",
                  "Average RSRQ", "Srxlev", "Frequency Offset", "Ant 0 Frame Offset", "Ant 0 Sample Offset",
                  "Ant 1 Frame Offset", "Ant 1 Sample Offset"},
         .logsContents = true},
        {"ReselectionCandidatesMisc", "Reselection Candidates", Kind::Dictionary, "Reselection Candidates",
         {{0xB186, 21}}, {"Version", "Serving EARFCN", "Serving Cell ID"}},
        {"ReselectionCandidatesList", "Reselection Candidates List", Kind::Array, "Reselection Candidates List",
         {{0xB186, 21}},
         {"Candidate Priority", "Candidate RAT Type", "E ARFCN", "Cell ID", "U ARFCN", "PSC", "ARFCN", "Band",
          "BSIC ID", "Channel", "Pilot"}},
        kSimInfo,
        kPdpContextList,
    });
    // clang-format on
    return kTechnology;
}

} // namespace kestrum
