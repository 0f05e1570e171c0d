#include "insight/keys/KeyTables.h"
#include "insight/keys/SubscriptionKeys.h"

namespace kestrum::keys {
namespace {

constexpr Dimension kRsrp{"dBm", Scale{-140, -44}, Measure::Rsrp}; // 3GPP TS 36.133, 9.1.4
constexpr Dimension kRsrq{"dB", Scale{-20, -3}, Measure::Rsrq};    // 3GPP TS 36.133, 9.1.7: -19.5 to -3
constexpr Dimension kRssi{"dBm", Scale{-110, -25}};
constexpr Dimension kSrxlev{"dBm", Scale{-30, 97}, Measure::Srxlev}; // the range of the record's field
constexpr Dimension kQrxlevmin{"dBm", Scale{-140, -44}};             // 3GPP TS 36.331, 6.3.4
constexpr Dimension kPower{"dBm", Scale{-30, 33}};                   // 3GPP TS 36.331, 6.3.4, P-Max
constexpr Dimension kSearchDb{"dB", Scale{0, 62}}, kSearchDbm{"dBm", Scale{0, 62}};
constexpr Dimension kPriorities{.scale = Scale{0, 7}};
constexpr Dimension kBandwidths{"MHz", Scale{0, 20}};

// clang-format off
constexpr KeyEntry kServingCellInfo[] = {
    {"Physical Cell ID", "PCI", Identity, kPlain, "3GPP TS 36.211, 6.11",
     "The identity that the cell's synchronisation signals carry, 0 to 503. Cells far from each other reuse it. "
     "Two neighbours with the same N_ID(2) have the same primary synchronisation signal.",
     fromPhysicalCellId, kIdentity},
    {"Cell Identity", "Cell", Identity, kPlain, "3GPP TS 36.331, 6.3.4; TS 36.413, 9.2.1.37",
     "The 28-bit identity of the cell, unique in its network. The upper 20 bits are the eNodeB, the lower 8 its cell. "
     "A home eNodeB uses all 28 bits for itself.",
     fromLteCellIdentity},
    {"Tracking Area Code", "TAC", Identity, kPlain, "3GPP TS 23.003, 19.4.2.3",
     "The tracking area of the cell. The phone registers again when it enters an area that is not in its list.",
     inHexadecimal},
    {"Freq Band Indicator", "Band", Identity, kPlain, "3GPP TS 36.101, table 5.5-1",
     "The number of the cell's E-UTRA frequency band.",
     fromLteBand},
    {"Download Frequency", "DL EARFCN", Identity, kPlain, "3GPP TS 36.101, 5.7.3",
     "The channel number (EARFCN) of the downlink. The field has 16 bits, so it cannot hold the numbers from 65536 of "
     "the bands 65 and above.",
     fromEarfcn, kIdentity},
    {"Upload Frequency", "UL EARFCN", Identity, kPlain, "3GPP TS 36.101, 5.7.3",
     "The channel number (EARFCN) of the uplink.",
     fromEarfcn},
    {"UARFCN", "EARFCN", Identity, kPlain, "3GPP TS 36.101, 5.7.3",
     "The channel number that the telephony service reports for the cell. For an LTE cell it is the EARFCN of the "
     "downlink. A record of the modem with both frequencies replaces it.",
     fromEarfcn},
    {"Download Bandwidth", "DL width", Number, kBandwidths, "3GPP TS 36.101, 5.6",
     "The channel bandwidth of the downlink.",
     fromLteBandwidth},
    {"Upload Bandwidth", "UL width", Number, kBandwidths, "3GPP TS 36.101, 5.6",
     "The channel bandwidth of the uplink.",
     fromLteBandwidth},
    {"Num Tx Antennas", "Tx antennas", Number, {.scale = Scale{0, 4}}, "3GPP TS 36.211, 6.10.1",
     "The number of antenna ports with cell-specific reference signals: 1, 2 or 4."},
};

constexpr KeyEntry kServingCellMeasurements[] = {
    {"Measured RSRP", "RSRP", Level, kRsrp, "3GPP TS 36.214, 5.1.1; TS 36.133, 9.1.4",
     "The mean power of one resource element with a reference signal. It is about 10 log10(12 N) dB below the power of "
     "N fully loaded resource blocks. This is the last measurement."},
    {"Average RSRP", "RSRP mean", Level, kRsrp, "3GPP TS 36.214, 5.1.1; TS 36.133, 9.1.4",
     "The reference signal's received power, averaged by the modem. Cell reselection uses averages."},
    {"Measured RSRQ", "RSRQ", Ratio, kRsrq, "3GPP TS 36.214, 5.1.3; TS 36.133, 9.1.7",
     "N times RSRP over RSSI, with N resource blocks in the bandwidth of the RSSI. It falls with interference, and also "
     "when the cell itself has traffic."},
    {"Average RSRQ", "RSRQ mean", Ratio, kRsrq, "3GPP TS 36.214, 5.1.3; TS 36.133, 9.1.7",
     "The reference signal's received quality, averaged by the modem."},
    {"Measured RSSI", "RSSI", Level, kRssi, "3GPP TS 36.214, 5.1.3",
     "The total power in the measured bandwidth: the serving cell, other cells, and noise. It depends on traffic."},
    {"Srxlev", "Srxlev", Ratio, kSrxlev, "3GPP TS 36.304, 5.2.3.2",
     "How far the level is above the lowest level for cell selection. A cell is suitable only if it is greater than 0. "
     "It is a ratio; the display shows it in dBm."},
    {"Physical Cell ID", "PCI", Identity, kPlain, "3GPP TS 36.211, 6.11",
     "The identity that the cell's synchronisation signals carry, 0 to 503.",
     fromPhysicalCellId, kIdentity},
    {"E-ARFCN", "EARFCN", Identity, kPlain, "3GPP TS 36.101, 5.7.3",
     "The channel number of the downlink.",
     fromEarfcn, kIdentity},
    {"Serving Layer Priority", "Priority", Number, kPriorities, "3GPP TS 36.304, 5.2.4.1",
     "The priority of the serving frequency for cell reselection, 0 to 7. The phone moves to a frequency of higher "
     "priority when a cell there stays above a threshold."},
    {"Qrxlevmin", "Qrxlevmin", Level, kQrxlevmin, "3GPP TS 36.304, 5.2.3.2",
     "The lowest RSRP at which a phone may select the cell, as the cell sends it."},
    {"P_Max", "P-Max", Level, kPower, "3GPP TS 36.331, 6.3.4; TS 36.101, 6.2.5",
     "The highest transmit power that the cell allows. \"Not Present\": the cell sets no limit."},
    {"Max UE Tx Power", "Max Tx", Level, kPower, "3GPP TS 36.101, 6.2.2",
     "The highest transmit power of the phone. Power class 3, the class of most phones, has 23 dBm."},
    {"S Intra Search", "S intra", Ratio, kSearchDb, "3GPP TS 36.304, 5.2.4.2",
     "While Srxlev is above it, the phone need not measure neighbours of the serving frequency. \"Not Present\": it "
     "always measures them."},
    {"S Non Intra Search", "S non-intra", Ratio, kSearchDbm, "3GPP TS 36.304, 5.2.4.2",
     "While Srxlev is above it, the phone need not measure frequencies of equal or lower priority. \"Not Present\": it "
     "always measures them. It is a ratio; the display shows it in dBm."},
    {"Num of Consecutive DRX Cycles of S < 0", "S < 0 cycles", Counter, kPlain, "3GPP TS 36.133, 4.2.2.1",
     "How many DRX cycles in a row the cell has failed the criterion S. After N_serv cycles the phone measures all "
     "neighbours, whatever the search thresholds are."},
    {"Measurement Rules", "Rules", Number, kPlain, "3GPP TS 36.304, 5.2.4.2",
     "Which neighbours the modem measures by the search thresholds, as a number of the modem."},
    {"Measurement Rules Updated", "New rules", State, kPlain, "3GPP TS 36.304, 5.2.4.2",
     "Whether this measurement changed the measurement rules."},
    {"Version", "Version", Number, kPlain, "",
     "The version of the modem's record."},
};

constexpr KeyEntry kNeighborMeasurements[] = {
    {"E-ARFCN", "EARFCN", Identity, kPlain, "3GPP TS 36.101, 5.7.3",
     "The channel number of the downlink of all cells in \"Neighbor Cells List\".",
     fromEarfcn, kIdentity},
    {"Qrxlevmin", "Qrxlevmin", Level, kQrxlevmin, "3GPP TS 36.304, 5.2.3.2",
     "The lowest RSRP at which a phone may select a cell of this frequency."},
    {"Version", "Version", Number, kPlain, "",
     "The version of the modem's record."},
};

constexpr KeyEntry kNeighborCellsList[] = {
    {"Physical Cell ID", "PCI", Identity, kPlain, "3GPP TS 36.211, 6.11",
     "The identity that the neighbour's synchronisation signals carry, 0 to 503.",
     fromPhysicalCellId, kIdentity},
    {"Measured RSRP", "RSRP", Level, kRsrp, "3GPP TS 36.214, 5.1.1; TS 36.133, 9.1.4",
     "The mean power of one resource element with a reference signal of the neighbour.",
     nullptr, kSortsRows},
    {"Measured RSRQ", "RSRQ", Ratio, kRsrq, "3GPP TS 36.214, 5.1.3; TS 36.133, 9.1.7",
     "The neighbour's reference signal in relation to the total power on the frequency."},
    {"Srxlev", "Srxlev", Ratio, kSrxlev, "3GPP TS 36.304, 5.2.3.2",
     "How far the neighbour is above the lowest level for cell selection. It is suitable only if this is greater than "
     "0. It is a ratio; the display shows it in dBm."},
    {"Average RSRP", "RSRP mean", Level, kRsrp, "3GPP TS 36.214, 5.1.1; TS 36.133, 9.1.4",
     "The neighbour's RSRP, averaged by the modem. Cell reselection uses averages."},
    {"Average RSRQ", "RSRQ mean", Ratio, kRsrq, "3GPP TS 36.214, 5.1.3; TS 36.133, 9.1.7",
     "The neighbour's RSRQ, averaged by the modem."},
    {"Measured RSSI", "RSSI", Level, kRssi, "3GPP TS 36.214, 5.1.3",
     "The total power on the frequency while the neighbour was measured."},
    {"Frequency Offset", "F offset", Number, kPlain, "",
     "The frequency error of the neighbour's signal, as a number of the modem without a unit."},
    {"Ant 0 Frame Offset", "Frame 0", Number, kPlain, "",
     "Where the neighbour's frame begins on the modem's clock, at antenna 0, as a number of the modem."},
    {"Ant 0 Sample Offset", "Sample 0", Number, kPlain, "",
     "The finer part of the frame offset at antenna 0, in samples of the modem."},
    {"Ant 1 Frame Offset", "Frame 1", Number, kPlain, "",
     "The same as for antenna 0: the display repeats its value."},
    {"Ant 1 Sample Offset", "Sample 1", Number, kPlain, "",
     "The same as for antenna 0: the display repeats its value."},
};

constexpr KeyEntry kReselectionCandidates[] = {
    {"Serving Cell ID", "PCI", Identity, kPlain, "3GPP TS 36.211, 6.11",
     "The physical cell identity of the cell from which the phone may reselect.",
     fromPhysicalCellId, kIdentity},
    {"Serving EARFCN", "EARFCN", Identity, kPlain, "3GPP TS 36.101, 5.7.3",
     "The channel number of the serving cell's downlink.",
     fromEarfcn, kIdentity},
    {"Version", "Version", Number, kPlain, "",
     "The version of the modem's record."},
};

// The keys after the technology depend on it.
constexpr KeyEntry kReselectionCandidatesList[] = {
    {"Candidate RAT Type", "Technology", State, kPlain, "3GPP TS 36.304, 5.2.4",
     "The candidate's radio access technology.",
     nullptr, kIdentity},
    {"E ARFCN", "EARFCN", Identity, kPlain, "3GPP TS 36.101, 5.7.3",
     "The channel number of the downlink of an LTE candidate.",
     fromEarfcn, kIdentity},
    {"Cell ID", "PCI", Identity, kPlain, "3GPP TS 36.211, 6.11",
     "The physical cell identity of an LTE candidate.",
     fromPhysicalCellId, kIdentity},
    {"U ARFCN", "UARFCN", Identity, kPlain, "3GPP TS 25.101, 5.4; TS 25.102, 5.4",
     "The channel number of the downlink of a UTRAN candidate.",
     fromAnyUarfcn, kIdentity},
    {"PSC", "PSC", Identity, kPlain, "3GPP TS 25.213, 5.2.2",
     "The primary scrambling code of a UTRAN candidate, 0 to 511.",
     fromScramblingCode, kIdentity},
    {"ARFCN", "ARFCN", Identity, kPlain, "3GPP TS 45.005, 2",
     "The channel number of a GSM candidate. 512 to 810 are channels of DCS 1800 and of PCS 1900.",
     fromArfcn, kIdentity},
    {"BSIC ID", "BSIC", Identity, kPlain, "3GPP TS 23.003, 4.3.2",
     "The base station identity code of a GSM candidate. Nearby cells on the same channel differ by it.",
     fromBsic, kIdentity},
    {"Band", "Band", Identity, kPlain, "3GPP TS 45.005, 2; 3GPP2 C.S0057",
     "For a CDMA candidate the band class. For a GSM candidate the band, as a number of the modem.",
     nullptr, kIdentity},
    {"Channel", "Channel", Identity, kPlain, "3GPP2 C.S0057",
     "The channel number of a CDMA candidate in its band class.",
     fromCandidateChannel, kIdentity},
    {"Pilot", "PN", Identity, kPlain, "3GPP2 C.S0002",
     "The PN offset of a CDMA candidate's pilot, 0 to 511, in units of 64 chips.",
     fromPilot, kIdentity},
    {"Candidate Priority", "Priority", Number, kPriorities, "3GPP TS 36.304, 5.2.4.1",
     "The priority of the candidate's frequency, 0 to 7. The phone prefers a higher priority to a stronger cell."},
};

constexpr KeyEntry kConnectedMode[] = {
    {"Serving Filtered RSRP", "RSRP", Level, kRsrp, "3GPP TS 36.331, 5.5.3.2; TS 36.214, 5.1.1",
     "The serving cell's RSRP after the layer 3 filter. Measurement reports and handovers use it."},
    {"Serving Filtered RSRQ", "RSRQ", Ratio, kRsrq, "3GPP TS 36.331, 5.5.3.2; TS 36.214, 5.1.3",
     "The serving cell's RSRQ after the layer 3 filter."},
    {"Serving Physical Cell ID", "PCI", Identity, kPlain, "3GPP TS 36.211, 6.11",
     "The serving cell's physical cell identity, 0 to 503.",
     fromPhysicalCellId, kIdentity},
    {"E-ARFCN", "EARFCN", Identity, kPlain, "3GPP TS 36.101, 5.7.3",
     "The channel number of the downlink, of the serving cell and of the cells measured with it.",
     fromEarfcn, kIdentity},
    {"Subframe Number", "Subframe", Counter, kPlain, "3GPP TS 36.211, 4",
     "The subframe of the measurement, as the modem counts. A subframe takes 1 ms."},
};

constexpr KeyEntry kMeasuredNeighborCells[] = {
    {"Physical Cell ID", "PCI", Identity, kPlain, "3GPP TS 36.211, 6.11",
     "The identity that the neighbour's synchronisation signals carry, 0 to 503.",
     fromPhysicalCellId, kIdentity},
    {"Filtered RSRP", "RSRP", Level, kRsrp, "3GPP TS 36.331, 5.5.3.2; TS 36.214, 5.1.1",
     "The neighbour's RSRP after the layer 3 filter. A neighbour that stays stronger than the serving cell by the "
     "offset of event A3 is reported for a handover.",
     nullptr, kSortsRows},
    {"Filtered RSRQ", "RSRQ", Ratio, kRsrq, "3GPP TS 36.331, 5.5.3.2; TS 36.214, 5.1.3",
     "The neighbour's RSRQ after the layer 3 filter."},
};

constexpr KeyEntry kDetectedCells[] = {
    {"Physical Cell ID", "PCI", Identity, kPlain, "3GPP TS 36.211, 6.11",
     "The physical cell identity of a cell that the modem found but did not measure.",
     fromPhysicalCellId, kIdentity},
};

constexpr std::string_view kConnectedModeName = "Connected mode LTE Intra-frequency Measurement";

constexpr SectionEntry kSections[] = {
    {"Serving Cell Info", "Identity, channels and bandwidths of the serving cell.", kServingCellInfo},
    {"Serving Cell Measurements", "What the modem measured of the serving cell, and the parameters of reselection.",
     kServingCellMeasurements},
    {"Neighbor Measurements", "What all neighbours measured in idle mode have in common.", kNeighborMeasurements},
    {"Neighbor Cells List", "The neighbours measured in idle mode, on one frequency.", kNeighborCellsList,
     "Serving Cell Measurements", KeyPlace{"Neighbor Measurements", "E-ARFCN"}},
    {"Reselection Candidates", "The cell from which the phone may reselect.", kReselectionCandidates},
    {"Reselection Candidates List", "The cells of any technology to which the phone may reselect.",
     kReselectionCandidatesList},
    {kConnectedModeName, "What the modem measured of the serving cell in connected mode.", kConnectedMode},
    {"Measured Neighbor Cells", "The neighbours measured in connected mode, on the serving frequency.",
     kMeasuredNeighborCells, kConnectedModeName, KeyPlace{kConnectedModeName, "E-ARFCN"}},
    {"Detected Cells", "The cells found, but not measured, in connected mode, on the serving frequency.",
     kDetectedCells, {}, KeyPlace{kConnectedModeName, "E-ARFCN"}},
    kSimInfo,
    kPdpContexts,
};
// clang-format on

} // namespace

constinit const std::span<const SectionEntry> kLte = kSections;

} // namespace kestrum::keys
