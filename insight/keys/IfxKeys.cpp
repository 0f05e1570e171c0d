#include "insight/keys/KeyTables.h"

// An IFX modem sends the display itself, as texts. These are the keys of the simulated GSM modem, and those of the
// machine's own modem, whose cells have any technology.
namespace kestrum::keys {
namespace {

constexpr Dimension kPathLoss{"", Scale{-30, 63}};
constexpr Dimension kRsrp{"dBm", Scale{-140, -44}, Measure::Rsrp}; // 3GPP TS 36.133, 9.1.4
constexpr Dimension kRsrq{"dB", Scale{-20, -3}, Measure::Rsrq};    // 3GPP TS 36.133, 9.1.7: -19.5 to -3
constexpr Dimension kRssi{"dBm", Scale{-110, -25}};
constexpr Dimension kSinr{"dB", Scale{-20, 40}, Measure::Sinr};
constexpr Dimension kErrorRate{"%", Scale{0, 20}};
constexpr Dimension kRxQual{"", Scale{0, 7}, Measure::RxQual};
constexpr Dimension kTransmitPower{"dBm", Scale{0, 39}}; // 3GPP TS 45.005, 4.1.1: up to 39 dBm

// clang-format off
constexpr KeyEntry kRoot[] = {
    {"Status", "Status", State, kPlain, "",
     "What the modem does, and what is in the way."},
    {"Signal Quality", "Quality", Percentage, {"%", Scale{0, 100}}, "",
     "The modem's own estimate. Modems compute it in different ways: it does not compare modems. \"Not recent\": the modem "
     "has not measured for a while."},
    {"Location", "Location", Text, kPlain, "",
     "Why the service cannot tell the cell's identity and area."},
    {"Cell Info", "Cells", Text, kPlain, "",
     "Why the service cannot tell the neighbour cells."},
    {"Signal", "Signal", Text, kPlain, "",
     "Why the service cannot tell the levels."},
    {"Data", "Data", Text, kPlain, "",
     "Why the service cannot tell the data connections."},
    {"SIM", "SIM", Text, kPlain, "",
     "Why the service cannot tell the SIM."},
    {"More Modems", "More", Counter, kPlain, "",
     "The modems that are not shown."},
    {"Time", "Time", Text, kPlain, "",
     "When this tree was made, in UTC."},
};

// Of the serving cell and of neighbours. A cell has those of its technology.
constexpr KeyEntry kCell[] = {
    {"Technology", "Technology", Identity, kPlain, "",
     "The radio access technology of the cell.",
     nullptr, kIdentity},
    {"Measured RSRP", "RSRP", Level, kRsrp, "3GPP TS 36.214, 5.1.1; TS 38.215, 5.1.1",
     "The mean power of one resource element with a reference signal: of the cell in LTE, of the synchronisation signal "
     "in NR.",
     nullptr, kSortsRows},
    {"Measured RSRQ", "RSRQ", Ratio, kRsrq, "3GPP TS 36.214, 5.1.3; TS 38.215, 5.1.3",
     "The reference signal in relation to the total power in the measured bandwidth. It falls with interference and with "
     "the cell's own traffic."},
    {"RSCP", "RSCP", Level, kRscp, "3GPP TS 25.215, 5.1.1; TS 25.225, 5.1.1",
     "The received power of the cell's pilot in UMTS, or of its primary common channel in TD-SCDMA.",
     nullptr, kSortsRows},
    {"Energy Per Chip", "Ec/Io", Ratio, kEcNo, "3GPP TS 25.215, 5.1.5",
     "The pilot in relation to the total power on the channel."},
    {"RSSI", "RSSI", Level, kRxLevDbm, "3GPP TS 45.008, 8.1.4",
     "In GSM the received level of the cell's broadcast carrier. In other technologies the total power on the channel: "
     "all cells, and noise.",
     nullptr, kSortsRows},
    {"RXLEV", "RXLEV", Level, kRxLevIndex, "3GPP TS 45.008, 8.1.4",
     "The received level as GSM counts it, 0 to 63 in steps of 1 dB.",
     fromRxLev},
    {"RSSI (derived)", "RxLev", Level, kRxLevDbm, "3GPP TS 45.008, 8.1.4",
     "The received level in dBm that RXLEV stands for."},
    {"Measured RSSI", "RSSI LTE", Level, kRssi, "3GPP TS 36.214, 5.1.3",
     "The total power in the measured bandwidth: the serving cell, other cells, and noise. It depends on traffic."},
    {"SNR", "SNR", Ratio, kSinr, "3GPP TS 36.101; TS 38.215, 5.1.5",
     "The ratio of signal to noise and interference. It decides which data rate is possible."},
    {"SINR", "SINR", Ratio, kSinr, "3GPP TS 38.215, 5.1.5",
     "The ratio of signal to noise and interference. It decides which data rate is possible."},
    {"Error Rate", "Errors", Percentage, kErrorRate, "",
     "The bit or block error rate that the modem reports."},
    {"Path Loss", "Path loss", Ratio, {"dB", Scale{40, 170}}, "3GPP TS 25.331, 10.3.7.38",
     "By how much the cell's signal is weaker here than at the antenna."},
    {"C1", "C1", Ratio, kPathLoss, "3GPP TS 45.008, 6.4",
     "The path loss criterion, in dB: how far the level is above the lowest access level. The phone leaves a cell whose C1 "
     "stays below 0."},
    {"C2", "C2", Ratio, kPathLoss, "3GPP TS 45.008, 6.4",
     "The reselection criterion, in dB: C1 with the cell's offset. The phone prefers the cell with the highest C2."},
    {"Physical Cell ID", "PCI", Identity, kPlain, "3GPP TS 36.211, 6.11; TS 38.211, 7.4.2",
     "The identity that the cell's synchronisation signals carry: 0 to 503 in LTE, 0 to 1007 in NR.",
     nullptr, kIdentity},
    {"Scrambling Code", "PSC", Identity, kPlain, "3GPP TS 25.213, 5.2.2",
     "The primary scrambling code of a UMTS cell, 0 to 511.",
     fromScramblingCode, kIdentity},
    {"Cell Parameter ID", "Code", Identity, kPlain, "3GPP TS 25.223",
     "The cell parameter of a TD-SCDMA cell, 0 to 127, which selects its scrambling code.",
     fromCellParameter, kIdentity},
    {"BSIC", "BSIC", Identity, kPlain, "3GPP TS 23.003, 4.3.2",
     "The base station identity code of a GSM cell, 0 to 63. Nearby cells on the same channel differ by it.",
     fromBsic, kIdentity},
    {"ARFCN", "ARFCN", Identity, kPlain, "3GPP TS 45.005, 2",
     "The channel number of a GSM cell's broadcast carrier. 512 to 810 are channels of DCS 1800 and of PCS 1900.",
     fromArfcn, kIdentity},
    {"UARFCN", "UARFCN", Identity, kPlain, "3GPP TS 25.101, 5.4; TS 25.102, 5.4",
     "The channel number of a UMTS or TD-SCDMA cell.",
     fromAnyUarfcn, kIdentity},
    {"E-ARFCN", "EARFCN", Identity, kPlain, "3GPP TS 36.101, 5.7.3",
     "The channel number of an LTE cell's downlink.",
     fromEarfcn, kIdentity},
    {"NR-ARFCN", "NR-ARFCN", Identity, kPlain, "3GPP TS 38.104, 5.4.2",
     "The channel number of an NR cell. Bands overlap, so it tells the frequency but not the band.",
     fromNrArfcn, kIdentity},
    {"Channel", "Channel", Identity, kPlain, "",
     "The channel number of a cell of unknown technology.",
     nullptr, kIdentity},
    {"Timing Advance", "TA", Number, kPlain, "3GPP TS 45.010, 5; TS 36.213, 4.2.3",
     "By how much the phone sends earlier, because the cell is far. The modem's unit depends on the technology."},
    {"Cell Identity", "Cell", Identity, kPlain, "3GPP TS 36.331, 6.3.4; TS 38.331, 6.3.2",
     "The identity of the cell, unique in its network: 28 bits in LTE, 36 bits in NR."},
    {"Cell ID", "Cell ID", Identity, kPlain, "3GPP TS 23.003, 4.3.1; TS 25.331, 10.3.2.2",
     "The identity of the cell: in GSM 16 bits, unique in its location area; in UMTS 28 bits, unique in its network.",
     fromCellIdentity},
    {"eNodeB (derived)", "eNodeB", Identity, kPlain, "3GPP TS 36.413, 9.2.1.37",
     "The LTE base station: the upper 20 bits of the cell identity."},
    {"Cell of eNodeB (derived)", "Sector", Identity, kPlain, "3GPP TS 36.413, 9.2.1.37",
     "The cell of the base station: the lower 8 bits of the cell identity."},
    {"RNC (derived)", "RNC", Identity, kPlain, "3GPP TS 25.401, 6.1",
     "The radio network controller: the upper 12 of the 28 bits of the cell identity."},
    {"Tracking Area Code", "TAC", Identity, kPlain, "3GPP TS 23.003, 19.4.2.3",
     "The tracking area of the cell. The phone registers again when it enters an area that is not in its list."},
    {"Location Area Code", "LAC", Identity, kPlain, "3GPP TS 23.003, 4.1",
     "The location area of the cell. The phone registers again when it enters another one.",
     inHexadecimal},
    {"LAC", "LA", Identity, kPlain, "3GPP TS 23.003, 4.1",
     "The location area of the cell. The phone registers again when it enters another one.",
     inHexadecimal},
    {"Mobile Country Code", "MCC", Identity, kPlain, "3GPP TS 23.003, 2.2; ITU-T E.212",
     "The country of the network."},
    {"Mobile Network Code", "MNC", Identity, kPlain, "3GPP TS 23.003, 2.2; ITU-T E.212",
     "The network in its country, two or three digits."},
    {"MCC", "Country", Identity, kPlain, "3GPP TS 23.003, 2.2; ITU-T E.212",
     "The country of the network."},
    {"MNC", "Network", Identity, kPlain, "3GPP TS 23.003, 2.2; ITU-T E.212",
     "The network in its country, two or three digits."},
    {"Operator Code", "Operator", Identity, kPlain, "",
     "The network, in a form that is neither five nor six digits."},
    {"Reference PN", "PN", Identity, kPlain, "3GPP2 C.S0002",
     "The PN offset of a CDMA cell's pilot, 0 to 511, in units of 64 chips.",
     fromPilot, kIdentity},
    {"Pilot Strength", "Pilot", Number, kPlain, "3GPP2 C.S0005, 2.6.6",
     "The strength of a CDMA cell's pilot, as the modem counts it."},
    {"System ID", "SID", Identity, kPlain, "3GPP2 C.S0005, 2.6.5",
     "The number of the operator's CDMA system in this area, 0 to 32767."},
    {"Network ID", "NID", Identity, kPlain, "3GPP2 C.S0005, 2.6.5",
     "The number of the CDMA network in the system, 0 to 65535."},
    {"Base Station ID", "Base", Identity, kPlain, "3GPP2 C.S0005",
     "The number of the CDMA base station in its system and network."},
};

constexpr KeyEntry kRegistration[] = {
    {"Registration State", "Registration", State, kPlain, "3GPP TS 27.007, 7.2",
     "Whether the modem is registered, at home or as a guest, and which services it then has."},
    {"Operator", "Operator", Text, kPlain, "",
     "The name of the network."},
    {"Mobile Country Code", "MCC", Identity, kPlain, "3GPP TS 23.003, 2.2; ITU-T E.212",
     "The country of the network."},
    {"Mobile Network Code", "MNC", Identity, kPlain, "3GPP TS 23.003, 2.2; ITU-T E.212",
     "The network in its country, two or three digits."},
    {"Operator Code", "Code", Identity, kPlain, "",
     "The network, in a form that is neither five nor six digits."},
    {"Access Technology", "Technology", State, kPlain, "",
     "The radio access technologies in use. 5G NSA: LTE carries the control, NR a part of the data."},
    {"Packet Service", "Packets", State, kPlain, "3GPP TS 27.007, 10.1.9",
     "Whether the modem is attached for packet data."},
};

constexpr KeyEntry kData[] = {
    {"Status", "Status", State, kPlain, "",
     "Whether the data connection is up."},
    {"APN", "APN", Text, kPlain, "3GPP TS 23.003, 9",
     "The packet network to which the connection leads.",
     nullptr, kIdentity},
    {"Interface", "Interface", Text, kPlain, "",
     "The network interface of this machine.",
     nullptr, kIdentity},
    {"Address", "IPv4", Text, kPlain, "",
     "The IPv4 address of the connection."},
    {"IPv6 Address", "IPv6", Text, kPlain, "",
     "The IPv6 address of the connection."},
    {"Duration", "Duration", Text, kPlain, "",
     "How long the connection is up: hours, minutes, seconds."},
    {"Bytes Received", "Received", Counter, kPlain, "",
     "The bytes received since the connection is up."},
    {"Bytes Sent", "Sent", Counter, kPlain, "",
     "The bytes sent since the connection is up."},
};

constexpr KeyEntry kSim[] = {
    {"Operator", "Operator", Text, kPlain, "",
     "The name of the operator that issued the SIM."},
    {"Mobile Country Code", "MCC", Identity, kPlain, "3GPP TS 23.003, 2.2; ITU-T E.212",
     "The country of the operator that issued the SIM."},
    {"Mobile Network Code", "MNC", Identity, kPlain, "3GPP TS 23.003, 2.2; ITU-T E.212",
     "The network of the operator that issued the SIM."},
    {"Operator Code", "Code", Identity, kPlain, "",
     "The operator, in a form that is neither five nor six digits."},
    {"IMSI", "IMSI", Identity, kPlain, "3GPP TS 23.003, 2.2",
     "The identity of the subscriber. Masked, unless the service was told to show identities."},
    {"ICCID", "ICCID", Identity, kPlain, "ETSI TS 102 221, 13.2",
     "The serial number of the SIM card. Masked, unless the service was told to show identities."},
};

constexpr KeyEntry kModem[] = {
    {"Manufacturer", "Manufacturer", Text, kPlain, "",
     "Who made the modem."},
    {"Model", "Model", Text, kPlain, "",
     "The modem's model."},
    {"Revision", "Revision", Text, kPlain, "",
     "The version of the modem's firmware."},
    {"State", "State", State, kPlain, "",
     "The modem's state: from locked and disabled to connected."},
    {"Lock", "Lock", State, kPlain, "",
     "The code that the modem waits for."},
    {"Equipment Identifier", "IMEI", Identity, kPlain, "3GPP TS 23.003, 6.2",
     "The serial number of the modem. Masked, unless the service was told to show identities."},
    {"Device Identifier", "Device", Identity, kPlain, "",
     "The name under which the system knows the modem, also after it was unplugged. Masked like the equipment identifier."},
    {"Daemon", "Daemon", Text, kPlain, "",
     "The program that talks to the modem."},
};

constexpr KeyEntry kPosition[] = {
    {"Fix", "Fix", State, kPlain, "",
     "Whether the position has a height (3D) or not (2D). Empty: there is no position."},
    {"Latitude", "Latitude", Number, {"", Scale{-90, 90}}, "",
     "Degrees north of the equator, by WGS 84."},
    {"Longitude", "Longitude", Number, {"", Scale{-180, 180}}, "",
     "Degrees east of Greenwich, by WGS 84."},
    {"Speed", "Speed", Number, {"m/s", Scale{0, 60}}, "",
     "The speed over ground."},
    {"Time", "Time", Text, kPlain, "",
     "When the receiver was at this position, in UTC."},
};

constexpr KeyEntry kRadioResource[] = {
    {"Band", "Band", Identity, kPlain, "3GPP TS 45.005, 2",
     "The frequency band of the serving cell."},
    {"Ciphering", "Ciphering", State, kPlain, "3GPP TS 43.020, 4",
     "The algorithm that encrypts the radio connection. \"None\": it is not encrypted, or there is no connection."},
};

constexpr KeyEntry kStatus[] = {
    {"State", "State", State, kPlain, "3GPP TS 44.018, 3",
     "Dedicated: the phone has a dedicated channel. Idle: it listens to broadcasts and pages."},
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

constexpr KeyEntry kContexts[] = {
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
    {"Serving Cell", "The cell on which the phone camps, or to which it is connected.", kCell},
    {"Neighbor Cells", "The neighbours that the phone measures, the strongest first.", kCell, "Serving Cell"},
    {"Radio Resource", "Band and encryption.", kRadioResource},
    {"Radio Resource/Status", "The channel in use.", kStatus},
    {"Mobility Management", "Registration.", kMobilityManagement},
    {"Packet Data", "The state of packet data.", kPacketData},
    {"Packet Data/PDP Contexts", "The connections to packet networks.", kContexts},
    {"Cell Changes", "How often the cell changed.", kCellChanges},
    {"Registration", "The network on which the modem is registered.", kRegistration},
    {"Data", "The data connections.", kData},
    {"SIM", "The SIM in use.", kSim},
    {"Modem", "The modem itself.", kModem},
    {"Position", "Where this machine is, by its satellite receiver.", kPosition},
};
// clang-format on

} // namespace

constinit const std::span<const SectionEntry> kIfx = kSections;
constinit const std::span<const KeyEntry> kIfxCell = kCell;
constinit const std::span<const KeyEntry> kIfxModem = kRoot;

} // namespace kestrum::keys
