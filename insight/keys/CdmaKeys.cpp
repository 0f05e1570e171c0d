#include "insight/keys/KeyTables.h"

// CDMA2000: EV-DO (3GPP2 C.S0024) and 1x (3GPP2 C.S0002, C.S0005). The sections are groups of the template.
namespace kestrum::keys {
namespace {

constexpr Dimension kPilotStrength{"dB", Scale{-31.5, 0}, Measure::PilotStrength}; // the range of 3GPP2 C.S0005
constexpr Dimension kCarrierToInterference{"dB", Scale{-20, 15}, Measure::CarrierToInterference};
constexpr Dimension kReceivePower{"dBm", Scale{-110, -20}, Measure::CdmaPower};
constexpr Dimension kTransmitPower{"dBm", Scale{-60, 30}};
constexpr Dimension kForwardRate{"kbps", Scale{0, 3200}}, kReverseRate{"kbps", Scale{0, 2000}};
constexpr Dimension kFrameErrors{"%", Scale{0, 20}, Measure::FrameErrors};

// clang-format off
constexpr KeyEntry kEvdo[] = {
    {"Forward Link Rate", "Rate down", Number, kForwardRate, "3GPP2 C.S0024",
     "The data rate to the phone since the previous record, counted from the received packets. A kilobit is 1024 bits."},
    {"Reverse Link Rate", "Rate up", Number, kReverseRate, "3GPP2 C.S0024",
     "The data rate from the phone since the previous record, counted from the sent packets. A kilobit is 1024 bits."},
};

constexpr KeyEntry kEvdoState[] = {
    {"Device State", "State", State, kPlain, "3GPP2 C.S0024",
     "What the modem does in EV-DO. Idle: it listens for pages. Connected: it has a traffic channel."},
    {"Session State", "Session", State, kPlain, "3GPP2 C.S0024",
     "The state of the session with the network. A session must be open before data can flow; it outlives connections."},
    {"Color Code", "Color", Identity, kPlain, "3GPP2 C.S0024",
     "The color code of the sector, which stands for its subnet. When it changes, the phone gets a new address."},
    {"UATI 24", "UATI", Identity, kPlain, "3GPP2 C.S0024",
     "The lower 24 bits of the unicast access terminal identifier, the phone's address in the network."},
};

constexpr KeyEntry kEvdoRadio[] = {
    {"Rx0 AGC", "Rx0", Level, kReceivePower, "3GPP2 C.S0033",
     "The total power that the first receiver gets on the channel: all cells, and noise."},
    {"Serving PN Offset", "PN", Identity, {"× 64chips"}, "3GPP2 C.S0024; C.S0002",
     "The offset of the serving sector's pilot sequence, 0 to 511, in units of 64 chips. Nearby sectors differ by it.",
     fromPilot, kIdentity},
    {"Channel", "Channel", Identity, kPlain, "3GPP2 C.S0057",
     "The channel number in its band class.",
     fromEvdoChannel, kIdentity},
    {"Band Class", "Band class", Identity, kPlain, "3GPP2 C.S0057",
     "The frequency band. Its number is in brackets.",
     nullptr, kIdentity},
    {"Tx AGC", "Tx", Level, kTransmitPower, "3GPP2 C.S0033",
     "The phone's transmit power, while it has a link. \"N/A\": it does not send."},
    {"Rx1 AGC", "Rx1", Level, kReceivePower, "3GPP2 C.S0033",
     "The total power that the second receiver gets on the channel. \"N/A\": without a link it is not used."},
};

constexpr KeyEntry kEvdoPilots[] = {
    {kAnyNumber, "Ec/Io", Ratio, kPilotStrength, "3GPP2 C.S0024",
     "The strength of a pilot of the active set: its energy in relation to the total received energy. The row's name is "
     "the pilot's PN offset.",
     nullptr, kSortsRows},
};

constexpr KeyEntry kEvdoFingers[] = {
    {kAnyNumber, "C/I", Ratio, kCarrierToInterference, "3GPP2 C.S0024",
     "The ratio of carrier to interference at a finger of the receiver. Each finger follows one path of a signal; the "
     "row's name is the PN offset of the pilot.",
     nullptr, kSortsRows},
};

constexpr KeyEntry kOneX[] = {
    {"Device State", "State", State, kPlain, "3GPP2 C.S0005, 2.6",
     "What the modem does in 1x. In slotted mode it sleeps between pages; in traffic it has a call or a data channel."},
    {"Traffic FER", "FER", Percentage, kFrameErrors, "3GPP2 C.S0002",
     "The frames of the traffic channel with errors, averaged over about 64 frames. Power control aims at 1 to 2 %. "
     "\"(old)\": the value of the last call."},
};

constexpr KeyEntry kOneXRadio[] = {
    {"Rx0 AGC", "Rx0", Level, kReceivePower, "3GPP2 C.S0011",
     "The total power that the first receiver gets on the channel: all cells, and noise."},
    {"Rx0 Channel", "Channel", Identity, kPlain, "3GPP2 C.S0057",
     "The channel number of the first receiver in its band class.",
     fromRx0Channel, kIdentity},
    {"Rx0 Band Class", "Band class", Identity, kPlain, "3GPP2 C.S0057",
     "The frequency band of the first receiver. Its number is in brackets.",
     nullptr, kIdentity},
    {"Tx AGC", "Tx", Level, kTransmitPower, "3GPP2 C.S0011",
     "The phone's transmit power during traffic. \"N/A\": it has no traffic channel."},
    {"Rx1 AGC", "Rx1", Level, kReceivePower, "3GPP2 C.S0011",
     "The total power that the second receiver gets on the channel. \"N/A\": outside traffic it is not used."},
    {"Rx1 Channel", "Channel 1", Identity, kPlain, "3GPP2 C.S0057",
     "The channel number of the second receiver in its band class.",
     fromRx1Channel},
    {"Rx1 Band Class", "Band class 1", Identity, kPlain, "3GPP2 C.S0057",
     "The frequency band of the second receiver. Its number is in brackets."},
};

constexpr KeyEntry kOneXActiveSet[] = {
    {kAnyNumber, "Ec/Io", Ratio, kPilotStrength, "3GPP2 C.S0005, 2.6.6",
     "The strength of a pilot of the active set: its energy in relation to the total received energy. The row's name is "
     "the pilot's PN offset; \"(ref pilot)\" marks the pilot from which the phone takes its time.",
     nullptr, kSortsRows},
};

constexpr KeyEntry kSystem[] = {
    {"System ID", "SID", Identity, kPlain, "3GPP2 C.S0005, 2.6.5",
     "The number of the operator's system in this area, 0 to 32767."},
    {"Network ID", "NID", Identity, kPlain, "3GPP2 C.S0005, 2.6.5",
     "The number of the network in the system, 0 to 65535."},
    {"Base Station ID", "Base", Identity, kPlain, "3GPP2 C.S0005",
     "The number of the base station in its system and network.",
     inHexadecimal, kIdentity},
    {"Packet Zone ID", "PZID", Identity, kPlain, "3GPP2 C.S0005",
     "The packet zone of the base station. When it changes, a phone with a dormant data session reconnects."},
    {"Roaming", "Roaming", State, kPlain, "3GPP2 C.R1001",
     "The roaming indicator. OFF is the home system."},
    {"Protocol Revision", "P_REV", Number, {.scale = Scale{0, 12}}, "3GPP2 C.S0005",
     "The protocol revision of the base station. Up to 5 it is IS-95; 6 is the first revision of CDMA2000."},
};

constexpr SectionEntry kSections[] = {
    {"EV-DO", "The packet data network of CDMA2000.", kEvdo},
    {"EV-DO/State", "State and addresses of the EV-DO session.", kEvdoState},
    {"EV-DO/Radio", "Channel, pilot and power of EV-DO.", kEvdoRadio},
    {"EV-DO/Active Set Pilots", "The sectors that may serve the phone.", kEvdoPilots},
    {"EV-DO/Finger C/I", "The fingers of the receiver, each on one path of a signal.", kEvdoFingers},
    {"1x", "Voice and slow data.", kOneX},
    {"1x/Radio", "Channel and power of 1x.", kOneXRadio},
    {"1x/Active Set", "The base stations that serve the phone.", kOneXActiveSet},
    {"System", "The identity of system, network and base station.", kSystem},
};
// clang-format on

} // namespace

constinit const std::span<const SectionEntry> kCdma = kSections;

} // namespace kestrum::keys
