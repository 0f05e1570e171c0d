#include "insight/keys/KeyTables.h"

// An IFX modem sends the display itself, as texts. These are the keys of a GSM modem; other trees are shown without an
// explanation.
namespace kestrum::keys {
namespace {

constexpr Dimension kPathLoss{"", Scale{-30, 63}};
constexpr Dimension kRxQual{"", Scale{0, 7}, Measure::RxQual};
constexpr Dimension kTransmitPower{"dBm", Scale{0, 39}}; // 3GPP TS 45.005, 4.1.1: up to 39 dBm

// clang-format off
constexpr KeyEntry kRoot[] = {
    {"Time", "Time", Text, kPlain, "",
     "When the modem made this tree, in UTC."},
};

constexpr KeyEntry kServingCell[] = {
    {"ARFCN", "ARFCN", Identity, kPlain, "3GPP TS 45.005, 2",
     "The channel number of the cell's broadcast carrier. 512 to 810 are channels of DCS 1800 and of PCS 1900.",
     fromArfcn, kIdentity},
    {"BSIC", "BSIC", Identity, kPlain, "3GPP TS 23.003, 4.3.2",
     "The base station identity code, 0 to 63. Nearby cells on the same channel differ by it.",
     fromBsic, kIdentity},
    {"RSSI", "RxLev", Level, kRxLevDbm, "3GPP TS 45.008, 8.1.4",
     "The received level of the cell's broadcast carrier."},
    {"C1", "C1", Ratio, kPathLoss, "3GPP TS 45.008, 6.4",
     "The path loss criterion, in dB: how far the level is above the lowest access level. The phone leaves a cell whose C1 "
     "stays below 0."},
    {"C2", "C2", Ratio, kPathLoss, "3GPP TS 45.008, 6.4",
     "The reselection criterion, in dB: C1 with the cell's offset. The phone prefers the cell with the highest C2."},
    {"Cell ID", "Cell", Identity, kPlain, "3GPP TS 23.003, 4.3.1",
     "The 16-bit identity of the cell, unique in its location area.",
     inHexadecimal},
    {"LAC", "LAC", Identity, kPlain, "3GPP TS 23.003, 4.1",
     "The location area of the cell. The phone registers again when it enters another one.",
     inHexadecimal},
    {"MCC", "MCC", Identity, kPlain, "3GPP TS 23.003, 2.2; ITU-T E.212",
     "The country of the network."},
    {"MNC", "MNC", Identity, kPlain, "3GPP TS 23.003, 2.2; ITU-T E.212",
     "The network in its country, two or three digits."},
};

constexpr KeyEntry kNeighborCells[] = {
    {"ARFCN", "ARFCN", Identity, kPlain, "3GPP TS 45.005, 2",
     "The channel number of the neighbour's broadcast carrier. 512 to 810 are channels of DCS 1800 and of PCS 1900.",
     fromArfcn, kIdentity},
    {"BSIC", "BSIC", Identity, kPlain, "3GPP TS 23.003, 4.3.2",
     "The neighbour's base station identity code, 0 to 63.",
     fromBsic, kIdentity},
    {"RSSI", "RxLev", Level, kRxLevDbm, "3GPP TS 45.008, 8.1.4",
     "The received level of the neighbour's broadcast carrier.",
     nullptr, kSortsRows},
    {"C1", "C1", Ratio, kPathLoss, "3GPP TS 45.008, 6.4",
     "The neighbour's path loss criterion, in dB. The phone does not move to a cell whose C1 is below 0."},
};

constexpr KeyEntry kRadioResource[] = {
    {"Band", "Band", Identity, kPlain, "3GPP TS 45.005, 2",
     "The frequency band of the serving cell."},
    {"Ciphering", "Ciphering", State, kPlain, "3GPP TS 43.020, 4",
     "The algorithm that encrypts the radio connection. \"None\": it is not encrypted, or there is no connection."},
};

constexpr KeyEntry kStatus[] = {
    {"State", "State", State, kPlain, "3GPP TS 44.018, 3",
     "Dedicated: the phone has a channel of its own. Idle: it listens to broadcasts and pages."},
    {"Channel", "Channel", State, kPlain, "3GPP TS 45.002, 3",
     "The kind of channel: BCCH/CCCH in idle mode, SDCCH for signalling, TCH/F for a call."},
    {"RxQual", "RxQual", Number, kRxQual, "3GPP TS 45.008, 8.2",
     "The received quality of a call, 0 (best) to 7.",
     fromRxQual},
    {"Tx Power", "Tx power", Level, kTransmitPower, "3GPP TS 45.005, 4.1.1",
     "The phone's transmit power, which the network orders. A high power means a weak or distant cell."},
    {"Timing Advance", "TA", Number, {.scale = Scale{0, 63}}, "3GPP TS 45.010, 5",
     "By how many bits the phone sends earlier, 0 to 63. A step is about 550 m of distance to the cell.",
     fromTimingAdvance},
};

constexpr KeyEntry kMobilityManagement[] = {
    {"MM State", "MM", State, kPlain, "3GPP TS 24.008, 4.1.2",
     "The state of mobility management for circuit-switched services."},
    {"GMM State", "GMM", State, kPlain, "3GPP TS 24.008, 4.1.3; TS 23.060, 6.1",
     "The state of mobility management for packet data. Ready: the network knows the cell. Standby: it knows the routing "
     "area."},
    {"Location Area", "LAI", Identity, kPlain, "3GPP TS 23.003, 4.1",
     "The location area of the registration: country, network and area code, the code in hexadecimal."},
    {"Equivalent PLMNs", "EPLMN", Identity, kPlain, "3GPP TS 24.008, 10.5.1.13",
     "A network that the phone treats like the registered one."},
};

constexpr KeyEntry kPacketData[] = {
    {"Attached", "Attached", State, kPlain, "3GPP TS 23.060, 6.5",
     "Whether the phone is attached for packet data."},
    {"Bytes Sent", "Sent", Counter, kPlain, "",
     "The bytes of user data that the phone has sent."},
    {"Bytes Received", "Received", Counter, kPlain, "",
     "The bytes of user data that the phone has received."},
};

constexpr KeyEntry kPdpContexts[] = {
    {"NSAPI", "NSAPI", Identity, kPlain, "3GPP TS 24.008, 10.5.6.2",
     "The number of the context, 5 to 15.",
     nullptr, kIdentity},
    {"APN", "APN", Text, kPlain, "3GPP TS 23.003, 9",
     "The packet network to which the context leads."},
    {"Address", "Address", Text, kPlain, "3GPP TS 24.008, 10.5.6.4",
     "The phone's address in the packet network."},
    {"QoS Class", "Class", Text, kPlain, "3GPP TS 23.107, 6.3",
     "The quality that the context asks for: conversational, streaming, interactive or background."},
};

constexpr KeyEntry kCellChanges[] = {
    {"Reselections", "Reselections", Counter, kPlain, "3GPP TS 45.008, 6.6",
     "How often the phone changed the cell by itself."},
    {"Handovers", "Handovers", Counter, kPlain, "3GPP TS 44.018, 3.4.4",
     "How often the network moved a call to another cell."},
    {"Location Updates", "Loc. updates", Counter, kPlain, "3GPP TS 24.008, 4.4",
     "How often the phone entered another location area."},
    {"Calls", "Calls", Counter, kPlain, "",
     "How many calls there were."},
    {"Cells Left", "Left", Identity, kPlain, "3GPP TS 23.003, 4.3.1",
     "The cells that the phone left, the latest first.",
     inHexadecimal},
};

constexpr SectionEntry kSections[] = {
    {"", "The modem's display.", kRoot},
    {"Serving Cell", "The cell on which the phone camps, or which carries its call.", kServingCell},
    {"Neighbor Cells", "The neighbours that the phone measures, the strongest first.", kNeighborCells, "Serving Cell"},
    {"Radio Resource", "Band and encryption.", kRadioResource},
    {"Radio Resource/Status", "The channel in use.", kStatus},
    {"Mobility Management", "Registration.", kMobilityManagement},
    {"Packet Data", "The state of packet data.", kPacketData},
    {"Packet Data/PDP Contexts", "The connections to packet networks.", kPdpContexts},
    {"Cell Changes", "How often the cell changed.", kCellChanges},
};
// clang-format on

} // namespace

constinit const std::span<const SectionEntry> kIfx = kSections;

} // namespace kestrum::keys
