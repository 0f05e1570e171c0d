// GSM and UMTS of one modem, which camps on one of them at a time.
#include "insight/EventTables.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

// The modem writes its cell only while it camps on this radio access, and the measurements of the same section a
// hundred times a second.
constexpr LogCode kGsmIdentity = 0x5134, kUmtsIdentity = 0x4127;

// clang-format off
constexpr CellPart kGsmCell[] = {
    {"cell",   {"GSM/GSM Serving Cell/Cell ID", kGsmIdentity}},
    {"ARFCN",  {"GSM/GSM Serving Cell/ARFCN",   kGsmIdentity}},
    {"BSIC",   {"GSM/GSM Serving Cell/BSIC",    kGsmIdentity}},
};
constexpr Place kGsmLevel[] = {{"GSM/GSM Serving Cell/RSSI"}};
constexpr CellLevel kGsmLevels[] = {{"RSSI", kGsmLevel}};
constexpr std::string_view kGsmInUse[] = {"RR_DATA_TRANSFER"};

constexpr CellPart kUmtsCell[] = {
    {"cell",   {"UMTS/UMTS RR Info/Cell ID", kUmtsIdentity}}, // with the RNC's identity: unique in its network (3GPP TS 25.331)
    {"UARFCN", {"UMTS/UMTS RR Info/Downlink Frequency", kUmtsIdentity}},
};
constexpr Place kUmtsPower[] = {{"UMTS/Active Set/0/RSCP"}};
constexpr Place kUmtsEnergy[] = {{"UMTS/Active Set/0/Energy Per Chip"}};
constexpr CellLevel kUmtsLevels[] = {{"RSCP", kUmtsPower}, {"Ec/No", kUmtsEnergy}};
constexpr std::string_view kUmtsInUse[] = {"CELL_DCH"};

constexpr Place kRrState = {"GSM/GSM RR Info/RR State", 0x512C};
constexpr Place kRrcState = {"UMTS/UMTS RR Info/RRC State", 0x4125};

// A cell identity of GSM is unique in its location area only: the frequency tells more cells apart.
constexpr ServingCellTable kCells[] = {
    {.radio = "GSM", .identity = kGsmCell, .decisive = 2, .campedBy = kGsmIdentity, .levels = kGsmLevels,
     .state = kRrState, .connected = kGsmInUse},
    {.radio = "UMTS", .identity = kUmtsCell, .decisive = 1, .campedBy = kUmtsIdentity, .levels = kUmtsLevels,
     .state = kRrcState, .connected = kUmtsInUse},
};

constexpr Place kRr[] = {kRrState}, kRrc[] = {kRrcState};
// Not from the service's cell report, which writes "1" where the modem writes "001".
constexpr LogCode kNetwork = 0x7135;
constexpr Place kArea[] = {
    {"Network and Registration/Serving PLMN/Mobile Country Code", kNetwork},
    {"Network and Registration/Serving PLMN/Mobile Network Code", kNetwork},
    {"Network and Registration/Serving PLMN/Location Area Code",  kNetwork},
    {"Network and Registration/Serving PLMN/Routing Area Code",   kNetwork},
};
constexpr Place kCircuitService[] = {{"Network and Registration/Process CS/MM Sub State"}};
constexpr Place kPacketService[] = {{"Network and Registration/Process PS/MM Sub State"}};
constexpr Place kCircuitUpdate[] = {{"Network and Registration/Process CS/LU Reject Cause"}};
constexpr Place kPacketUpdate[] = {{"Network and Registration/Process PS/Attach Reject Cause"}};
constexpr Place kCircuit[] = {{"Network and Registration/Process CS/MM State"}};
constexpr Place kPacket[] = {{"Network and Registration/Process PS/MM State"}};
constexpr Place kContexts[] = {{"Subscription and Data/PDP Context Info/*/Access Point Name"}};

constexpr FollowedValue kValues[] = {
    {EventKind::RrcState,     "GSM RR state",           kRr},
    {EventKind::RrcState,     "UMTS RRC state",         kRrc},
    {EventKind::Registration, "network and area",       kArea},
    {EventKind::Registration, "service for calls",      kCircuitService},
    {EventKind::Registration, "service for packets",    kPacketService},
    {EventKind::Registration, "location update",        kCircuitUpdate},
    {EventKind::Registration, "routing area update",    kPacketUpdate},
    {EventKind::Call,         "mobility management",    kCircuit},
    {EventKind::Data,         "GPRS mobility",          kPacket},
    {EventKind::Data,         "access points",          kContexts},
};
// clang-format on

} // namespace

constinit const EventTable kGsmEvents{
    .technology = kVoxLogChannelTechnology_Zephra_GSM,
    .name = "GSM/UMTS",
    .cells = kCells,
    .values = kValues,
};

} // namespace kestrum
