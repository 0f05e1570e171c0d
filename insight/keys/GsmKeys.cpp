#include "insight/keys/KeyTables.h"
#include "insight/keys/SubscriptionKeys.h"

// GSM, GPRS and UMTS (UTRA FDD).
namespace kestrum::keys {
namespace {

constexpr Dimension kTransmitPower{"dBm", Scale{-50, 24}}; // 3GPP TS 25.101, 6.2.1 and 6.4.3
constexpr Dimension kPathLoss{"", Scale{-30, 63}};
constexpr Dimension kRxQualIndex{"", Scale{0, 7}};
constexpr Dimension kReceivedLevel{"dBm", Scale{-110, -48}, Measure::RxLev, ""}; // the second source sends RXLEV
constexpr Dimension kRscpInDb{"dB", Scale{-120, -25}, Measure::Rscp};
constexpr Dimension kRscpOfTwo{"dBm", Scale{-120, -25}, Measure::Rscp, "dB"};

// clang-format off
constexpr KeyEntry kServingPlmn[] = {
    {"Service Type", "Service", State, kPlain, "3GPP TS 23.122, 3.5",
     "The service that the cell gives: circuit-switched (CS), packet-switched (PS), both, emergency calls only (limited), "
     "or none."},
    {"Mobile Country Code", "MCC", Identity, kPlain, "3GPP TS 23.003, 2.2; ITU-T E.212",
     "The country of the network."},
    {"Mobile Network Code", "MNC", Identity, kPlain, "3GPP TS 23.003, 2.2; ITU-T E.212",
     "The network in its country, two or three digits. A plain number has lost its leading zeros."},
    {"Location Area Code", "LAC", Identity, kPlain, "3GPP TS 23.003, 4.1",
     "The location area of the cell. The phone registers again when it enters another one.",
     inHexadecimal},
    {"Routing Area Code", "RAC", Identity, kPlain, "3GPP TS 23.003, 4.2",
     "The routing area of the cell, a part of the location area, for packet data."},
    {"PLMN Sel Mod", "Selection", State, kPlain, "3GPP TS 23.122, 4.4",
     "Whether the phone or its user selects the network."},
};

constexpr KeyEntry kEquivalentPlmnList[] = {
    {"Mobile Country Code", "MCC", Identity, kPlain, "3GPP TS 24.008, 10.5.1.13",
     "The country of a network that counts as equivalent to the registered one.",
     nullptr, kIdentity},
    {"Mobile Network Code", "MNC", Identity, kPlain, "3GPP TS 24.008, 10.5.1.13",
     "The network in its country. The phone may reselect its cells without a search for networks.",
     nullptr, kIdentity},
};

constexpr KeyEntry kProcessCs[] = {
    {"MM State", "MM", State, kPlain, "3GPP TS 24.008, 4.1.2.1",
     "The state of mobility management for circuit-switched services: calls, short messages, location updates."},
    {"MM Sub State", "MM substate", State, kPlain, "3GPP TS 24.008, 4.1.2.1.2",
     "The substate of MM_IDLE. MM_NORMAL_SERVICE: registered and in coverage."},
    {"LU Reject Cause", "Update", State, kPlain, "3GPP TS 24.008, 4.1.2.2",
     "The update status of the SIM, not a cause: whether the last location update succeeded or was refused."},
    {"MM Service State", "Registration", State, kPlain, "",
     "The state of the modem's registration: idle, registering, searching for a network, or off."},
};

constexpr KeyEntry kProcessPs[] = {
    {"MM State", "GMM", State, kPlain, "3GPP TS 24.008, 4.1.3.1",
     "The state of mobility management for packet data (GMM). GMM_REGISTERED: attached."},
    {"MM Sub State", "GMM substate", State, kPlain, "3GPP TS 24.008, 4.1.3.1",
     "The substate of GMM_REGISTERED or GMM_DEREGISTERED."},
    {"Attach Reject Cause", "Update", State, kPlain, "3GPP TS 24.008, 4.1.3.2",
     "The GPRS update status, not a cause: whether the last attach or routing area update succeeded or was refused."},
    {"MM Service State", "Registration", State, kPlain, "",
     "The state of the modem's registration: idle, registering, searching for a network, or off."},
};

constexpr KeyEntry kProcessCo[] = {
    {"MM State", "MM", State, kPlain, "3GPP TS 24.008, 4.1.2.1",
     "The state of mobility management."},
    {"MM Service State", "Registration", State, kPlain, "",
     "The state of the modem's registration: idle, registering, searching for a network, or off."},
};

constexpr KeyEntry kGsmServingCell[] = {
    {"ARFCN", "ARFCN", Identity, kPlain, "3GPP TS 45.005, 2",
     "The channel number of the cell's broadcast carrier. 512 to 810 are channels of DCS 1800 and of PCS 1900; the number "
     "alone does not tell which.",
     fromArfcn, kIdentity},
    {"BSIC", "BSIC", Identity, kPlain, "3GPP TS 23.003, 4.3.2",
     "The base station identity code, 0 to 63. Nearby cells on the same channel differ by it.",
     fromBsic, kIdentity},
    {"RSSI", "RxLev", Level, {"dBm", Scale{0, 63}}, "3GPP TS 45.008, 8.1.4",
     "The byte of the received level, shown in dBm without a sign. It is also the \"Serving Rx Level\": as RXLEV, n is "
     "a level from n - 111 to n - 110 dBm.",
     fromRxLev},
    {"C1 Value", "C1", Ratio, kPathLoss, "3GPP TS 45.008, 6.4",
     "The path loss criterion, in dB: how far the level is above the lowest access level. The phone leaves a cell whose C1 "
     "stays below 0. During a call this word of the record holds the received quality."},
    {"C2 Value", "C2", Ratio, kPathLoss, "3GPP TS 45.008, 6.4",
     "The reselection criterion, in dB: C1 with the cell's offset. The phone moves to the cell with the highest C2. "
     "During a call this word of the record holds the received quality."},
    {"Cell ID", "Cell", Identity, kPlain, "3GPP TS 23.003, 4.3.1",
     "The 16-bit identity of the cell, unique in its location area.",
     inHexadecimal},
    {"MA Dedicated ARFCN", "Ded. ARFCN", Identity, kPlain, "3GPP TS 44.018, 10.5.2.5",
     "The channel of the call. Only the lower 8 bits of the channel number are shown, so it tells no frequency."},
};

constexpr KeyEntry kGsmRrInfo[] = {
    {"RR State", "RR", State, kPlain, "3GPP TS 44.018, 3",
     "The state of radio resource management in the modem. RR_IDLE: the phone camps on a cell. RR_DATA_TRANSFER: it has a "
     "channel."},
    {"RR Mode", "Mode", State, kPlain, "",
     "What the channel carries: voice or data."},
    {"Serving Rx Level", "RxLev", Level, kRxLevIndex, "3GPP TS 45.008, 8.1.4",
     "The received level RXLEV, 0 to 63 in steps of 1 dB. n is a level from n - 111 to n - 110 dBm.",
     fromRxLev},
    {"Rx Quality Full", "RxQual full", Number, kRxQualIndex, "3GPP TS 45.008, 8.2",
     "The received quality RXQUAL over all frames of a call, 0 (best) to 7. Outside a call this word of the record holds "
     "C1: a number is a quality only during a call.",
     fromRxQual},
    {"Rx Quality Sub", "RxQual sub", Number, kRxQualIndex, "3GPP TS 45.008, 8.2",
     "The received quality RXQUAL over the frames that are sent even in silence. With DTX it is the valid one. Outside a "
     "call this word of the record holds C2.",
     fromRxQual},
    {"DTX Used", "DTX", State, kPlain, "3GPP TS 45.008, 8.3",
     "Whether the transmitter pauses in the silences of speech (discontinuous transmission)."},
    {"DRX Used", "DRX", Time, {"sec"}, "3GPP TS 44.060, 5.5.1.5",
     "For how long after a transfer the phone listens to all blocks of its channel, before it sleeps between pages. It is "
     "the record's number, shown in seconds."},
    {"RR Sub State", "RR substate", Number, kPlain, "",
     "The substate of radio resource management, as a number of the modem."},
    {"RR Status", "RR status", Number, kPlain, "",
     "The status of radio resource management, as a number of the modem."},
};

constexpr KeyEntry kNeighboringCells[] = {
    {"ARFCN", "ARFCN", Identity, kPlain, "3GPP TS 45.005, 2",
     "The channel number of the neighbour's broadcast carrier. 512 to 810 are channels of DCS 1800 and of PCS 1900.",
     fromArfcn, kIdentity},
    {"BSIC", "BSIC", Identity, kPlain, "3GPP TS 23.003, 4.3.2",
     "The neighbour's base station identity code, if the modem has decoded it.",
     fromBsic, kIdentity},
    {"RSSI", "RxLev", Level, kReceivedLevel, "3GPP TS 45.008, 8.1.4",
     "The neighbour's received level. From the modem it is RXLEV, a number without a unit: n is a level from n - 111 to "
     "n - 110 dBm. From the telephony service it is a level in dBm.",
     nullptr, kSortsRows},
    {"C1 Value", "C1", Ratio, kPathLoss, "3GPP TS 45.008, 6.4",
     "The neighbour's path loss criterion, in dB. The phone does not move to a cell whose C1 is below 0."},
};

constexpr KeyEntry kGprsInformation[] = {
    {"Network Operating Mode", "NMO", State, kPlain, "3GPP TS 23.060, 6.3.3.1",
     "How the network pages for calls and for packet data. Class 1 is mode I: both on the same channel, and combined "
     "location and routing area updates."},
    {"Network Control Order", "NC", State, kPlain, "3GPP TS 45.008, 10.1.4",
     "Who decides on cell changes during packet transfer: with NC0 the phone, with NC1 the phone, which also reports "
     "measurements, with NC2 the network."},
    {"Priority Access Threshold", "Access", State, kPlain, "3GPP TS 44.018, 10.5.2.37b",
     "The priorities that may access the cell for packet data."},
    {"Packet SI Status", "SI status", State, kPlain, "3GPP TS 44.060, 11.2",
     "Whether the cell supports the message PACKET SI STATUS."},
    {"Packet PSI Status", "PSI status", Number, kPlain, "3GPP TS 44.060, 11.2",
     "Whether the cell supports the message PACKET PSI STATUS. 0: not supported."},
    {"PFC Supported", "PFC", State, kPlain, "3GPP TS 44.060",
     "Whether the cell supports packet flow contexts, which give each service its quality."},
    {"PBCCH Present", "PBCCH", Number, kPlain, "3GPP TS 44.018, 10.5.2.37b",
     "Whether the cell has a broadcast channel for packet data. 0: no, its parameters are in system information 13."},
    {"SI13 Position", "SI13", State, kPlain, "3GPP TS 44.018, 10.5.2.34",
     "On which broadcast channel the cell sends system information 13, the parameters of GPRS."},
    {"Access Burst Type", "Burst", State, kPlain, "3GPP TS 44.060, 12.24",
     "The format of the phone's access burst: 8 or 11 bits of information."},
    {"T3192", "T3192", Time, {"ms", Scale{0, 1500}}, "3GPP TS 44.060, 13.1",
     "How long the phone keeps listening to its downlink channel after the last block of a transfer."},
    {"DRX Timer Max", "DRX timer", Number, kPlain, "3GPP TS 44.060, 12.24",
     "The longest non-DRX time that the cell allows after a transfer, as a number of the modem."},
    {"Cell Reselect Hysteresis", "Hysteresis", State, kPlain, "3GPP TS 45.008, 6.6.2",
     "Whether the phone applies the hysteresis against reselections back and forth."},
    {"Ext Measurement Order", "Ext order", Number, kPlain, "3GPP TS 45.008, 10.1.5",
     "Whether the network orders extended measurement reports, as a number of the modem."},
    {"Count LR", "Count LR", Number, kPlain, "3GPP TS 44.060, 11.2",
     "How many packet system information messages the cell sends at the low repetition rate."},
    {"Count HR", "Count HR", Number, kPlain, "3GPP TS 44.060, 11.2",
     "How many packet system information messages the cell sends at the high repetition rate."},
};

constexpr KeyEntry kMobileAllocation[] = {
    {"ARFCNs", "ARFCNs", Identity, kPlain, "3GPP TS 44.018, 10.5.2.21; TS 45.002, 6.2",
     "The channels over which a call hops.",
     fromArfcn},
    {"HSN", "HSN", Identity, kPlain, "3GPP TS 45.002, 6.2.3",
     "The hopping sequence number. 0: the channels follow each other in order. 1 to 63: pseudo-random sequences.",
     fromHoppingSequence},
};

constexpr KeyEntry kUmtsRrInfo[] = {
    {"RRC State", "RRC", State, kPlain, "3GPP TS 25.331, 7",
     "The state of the radio connection. In CELL_DCH the phone has a dedicated channel, in CELL_FACH it shares one, in "
     "CELL_PCH and URA_PCH it only listens to paging. \"Disconnected\" is idle mode."},
    {"Scrambling Code", "PSC", Identity, kPlain, "3GPP TS 25.213, 5.2.2",
     "The primary scrambling code of the cell, 0 to 511. Nearby cells on the same channel differ by it.",
     fromScramblingCode, kIdentity},
    {"Downlink Frequency", "DL UARFCN", Identity, kPlain, "3GPP TS 25.101, 5.4",
     "The channel number (UARFCN) of the downlink.",
     fromDownlinkUarfcn, kIdentity},
    {"Uplink Frequency", "UL UARFCN", Identity, kPlain, "3GPP TS 25.101, 5.4",
     "The channel number (UARFCN) of the uplink.",
     fromUplinkUarfcn},
    {"UARFCN", "UARFCN", Identity, kPlain, "3GPP TS 25.101, 5.4",
     "The channel number of the downlink that the telephony service reports. A record of the modem with both frequencies "
     "replaces it.",
     fromDownlinkUarfcn},
    {"Cell ID", "Cell", Identity, kPlain, "3GPP TS 25.331, 10.3.2.2; TS 25.401, 6.1",
     "The 28-bit identity of the cell, unique in its network: 12 bits of the RNC and 16 of its cell. With an extended "
     "RNC identity it is 16 and 12 bits.",
     fromUtranCellIdentity},
    {"Transmit Power", "Tx power", Level, kTransmitPower, "3GPP TS 25.215, 5.1.7; TS 25.101, 6.2.1",
     "The phone's transmit power, the mean of the values of one record. A high power means a weak or distant cell; power "
     "class 3 ends at 24 dBm. \"nan\": the record has no value."},
    {"Ciphering", "Ciphering", State, kPlain, "3GPP TS 33.102, 6.6",
     "Whether the radio connection is encrypted."},
    {"URA ID", "URA", Identity, kPlain, "3GPP TS 25.331, 10.3.2.6",
     "The UTRAN registration area. In URA_PCH the network pages the phone in all cells of this area."},
};

constexpr KeyEntry kActiveSet[] = {
    {"Scrambling Code", "PSC", Identity, kPlain, "3GPP TS 25.213, 5.2.2",
     "The primary scrambling code of a cell of the active set, 0 to 511.",
     fromScramblingCode, kIdentity},
    {"RSCP", "RSCP", Level, kRscpInDb, "3GPP TS 25.215, 5.1.1; TS 25.133, 9.1.1",
     "The received power of the cell's common pilot. It is a level in dBm; the display shows it in dB.",
     nullptr, kSortsRows},
    {"Energy Per Chip", "Ec/No", Ratio, kEcNo, "3GPP TS 25.215, 5.1.5; TS 25.133, 9.1.2",
     "The common pilot in relation to the total power on the channel. It falls with interference and with the cell's own "
     "traffic."},
};

constexpr KeyEntry kBler[] = {
    {"Window Size", "Window", Number, kPlain, "",
     "The length of the measurement window, as the modem counts it."},
};

constexpr KeyEntry kTransportChannels[] = {
    {"Transport Channel ID", "Channel", Identity, kPlain, "3GPP TS 25.331, 10.3.5.18",
     "The identity of the transport channel.",
     nullptr, kIdentity},
    {"CRC Received in Error", "Errors", Counter, kPlain, "3GPP TS 25.215, 5.1.6",
     "The transport blocks whose checksum was wrong.",
     fromBlockErrors},
    {"CRC Received", "Blocks", Counter, kPlain, "3GPP TS 25.215, 5.1.6",
     "The transport blocks with a checksum that were received.",
     fromBlockErrors},
};

constexpr KeyEntry kHsdpaInfo[] = {
    {"Carrier Info", "Carriers", State, kPlain, "3GPP TS 25.306",
     "Whether HSDPA uses one carrier, two carriers, or MIMO."},
    {"Sub Frames", "Subframes", Counter, kPlain, "3GPP TS 25.211, 5.3.3.13",
     "The subframes of 2 ms that the record covers."},
    {"Version", "Version", Number, kPlain, "",
     "The version of the modem's record."},
};

constexpr KeyEntry kHarqProcess[] = {
    {"Process ID", "Process", Identity, kPlain, "3GPP TS 25.321, 11.6",
     "The number of the HARQ process. Several processes take turns, so that data flows while one waits for its answer.",
     nullptr, kIdentity},
    {"Block Errors", "Errors", Counter, kPlain, "3GPP TS 25.321, 11.6",
     "The transport blocks that were received with errors."},
    {"New Tx", "New", Counter, kPlain, "3GPP TS 25.321, 11.6",
     "The new transmissions, without the repeated ones."},
    {"No Rx Bits", "Bits", Counter, kPlain, "",
     "The number of received bits."},
};

constexpr KeyEntry kGsmSet[] = {
    {"ARFCN", "ARFCN", Identity, kPlain, "3GPP TS 45.005, 2",
     "The channel number of a GSM candidate. 512 to 810 are channels of DCS 1800 and of PCS 1900.",
     fromArfcn, kIdentity},
    {"BSIC", "BSIC", Identity, kPlain, "3GPP TS 23.003, 4.3.2",
     "The base station identity code of a GSM candidate, 0 to 63.",
     fromBsic, kIdentity},
    {"RSSI", "RxLev", Level, kRxLevDbm, "3GPP TS 45.008, 8.1.4",
     "The received level of the candidate.",
     nullptr, kSortsRows},
    {"Ranking Value", "Rank", Number, kPlain, "3GPP TS 25.304, 5.2.6",
     "The value of the ranking criterion R. The phone reselects the cell with the highest one."},
};

constexpr KeyEntry kUmtsSet[] = {
    {"Scrambling Code", "PSC", Identity, kPlain, "3GPP TS 25.213, 5.2.2",
     "The primary scrambling code of a UMTS cell, 0 to 511.",
     fromScramblingCode, kIdentity},
    {"Downlink Frequency", "DL UARFCN", Identity, kPlain, "3GPP TS 25.101, 5.4",
     "The channel number (UARFCN) of the downlink, from the modem.",
     fromDownlinkUarfcn, kIdentity},
    {"UARFCN", "UARFCN", Identity, kPlain, "3GPP TS 25.101, 5.4",
     "The channel number of the downlink, from the telephony service.",
     fromDownlinkUarfcn, kIdentity},
    {"RSCP", "RSCP", Level, kRscpOfTwo, "3GPP TS 25.215, 5.1.1; TS 25.133, 9.1.1",
     "The received power of the cell's common pilot, a level in dBm. The modem's values are shown in dB, those of the "
     "telephony service in dBm.",
     nullptr, kSortsRows},
    {"Energy Per Chip", "Ec/No", Ratio, kEcNo, "3GPP TS 25.215, 5.1.5; TS 25.133, 9.1.2",
     "The common pilot in relation to the total power on the channel. It falls with interference."},
    {"Ranking Value", "Rank", Number, kPlain, "3GPP TS 25.304, 5.2.6",
     "The value of the ranking criterion R. The phone reselects the cell with the highest one."},
    {"Rank Cell RSCP", "Rank RSCP", Level, {"dB", Scale{-120, -25}}, "3GPP TS 25.304, 5.2.6",
     "The level with which the cell was ranked. It is a level in dBm; the display shows it in dB."},
};

constexpr SectionEntry kSections[] = {
    {"Serving PLMN", "The network, and the areas of the serving cell.", kServingPlmn},
    {"Equivalent PLMN List", "The networks that the phone treats like the registered one.", kEquivalentPlmnList},
    {"Process CS", "Registration and mobility management for circuit-switched services.", kProcessCs},
    {"Process PS", "Registration and mobility management for packet data.", kProcessPs},
    {"Process CO", "Registration and mobility management, for both.", kProcessCo},
    {"GSM Serving Cell", "The GSM cell on which the phone camps, or which carries its call.", kGsmServingCell},
    {"GSM RR Info", "Radio resource management of GSM: state, level and quality.", kGsmRrInfo},
    {"Neighboring Cells", "The GSM neighbours that the phone measures.", kNeighboringCells, "GSM Serving Cell"},
    {"GPRS Information", "The cell's parameters for packet data.", kGprsInformation},
    {"Coding Scheme", "Stays empty: no record fills it.", {}},
    {"Mobile Allocation", "The channels over which a call hops.", kMobileAllocation},
    {"UMTS RR Info", "Radio resource control of UMTS: state, serving cell, transmit power.", kUmtsRrInfo},
    {"Active Set", "The UMTS cells that carry the connection; in idle mode the serving cell.", kActiveSet,
     "UMTS RR Info", KeyPlace{"UMTS RR Info", "Downlink Frequency"}},
    {"Monitored Set", "Stays empty: the decoder does not read these cells.", {}},
    {"Detected Set", "Stays empty: the decoder does not read these cells.", {}},
    {"Virtual Active Set", "Stays empty: the decoder does not read these cells.", {}},
    {"UMTS RR Measurement", "Stays empty: no record fills it.", {}},
    {"BLER", "Block errors of the transport channels.", kBler},
    {"Transport Channels", "The block errors of each transport channel.", kTransportChannels},
    {"HSDPA Info", "High-speed packet data in the downlink.", kHsdpaInfo},
    {"Primary HARQ Process", "The HARQ processes of the first carrier or stream.", kHarqProcess},
    {"Secondary HARQ Process", "The HARQ processes of the second carrier or stream.", kHarqProcess},
    {"GSM Set", "The GSM cells ranked for reselection.", kGsmSet},
    {"UMTS Set", "The UMTS cells: those ranked for reselection, or the neighbours that the telephony service reports.",
     kUmtsSet, "UMTS RR Info"},
    {"Non-Ranked GSM Set", "Stays empty: no record fills it.", {}},
    {"Non-Ranked UMTS Set", "Stays empty: no record fills it.", {}},
    {"Cell Change Counters", "Stays empty: no record fills it.", {}},
    kSimInfo,
    kPdpContexts,
};
// clang-format on

} // namespace

constinit const std::span<const SectionEntry> kGsm = kSections;

} // namespace kestrum::keys
