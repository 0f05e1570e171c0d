#include "insight/EventTables.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

// clang-format off
constexpr CellPart kCell[] = {
    {"cell",   {"Serving Cell/Serving Cell Info/Cell Identity"}}, // unique in its network (3GPP TS 36.300)
    {"PCI",    {"Serving Cell/Serving Cell Info/Physical Cell ID"}},
    {"EARFCN", {"Serving Cell/Serving Cell Info/Download Frequency"}},
};

constexpr Place kPower[] = {
    {"Serving Cell/Serving Cell Measurements/Measured RSRP"},
    {"Connected Mode/Connected mode LTE Intra-frequency Measurement/Serving Filtered RSRP"},
};
constexpr Place kQuality[] = {
    {"Serving Cell/Serving Cell Measurements/Measured RSRQ"},
    {"Connected Mode/Connected mode LTE Intra-frequency Measurement/Serving Filtered RSRQ"},
};
constexpr CellLevel kLevels[] = {{"RSRP", kPower}, {"RSRQ", kQuality}};

constexpr StateName kIdle{"Idle"}, kConnected{"Connected"};
constexpr std::string_view kInUse[] = {kConnected.text};

constexpr ServingCellTable kCells[] = {
    {.radio = "LTE", .identity = kCell, .decisive = 1, .levels = kLevels, .connected = kInUse},
};

constexpr Place kArea[] = {{"Serving Cell/Serving Cell Info/Tracking Area Code"}};
constexpr Place kBearers[] = {{"Subscription and Data/PDP Context Info/*/Access Point Name"}};

constexpr FollowedValue kValues[] = {
    {EventKind::Registration, "tracking area", kArea},
    {EventKind::Data,         "access points", kBearers},
};

// The modem measures for reselection while it is idle, and for the network's reports while it is connected.
constexpr ImpliedState kStates[] = {
    {0xB180, &kIdle},
    {0xB186, &kIdle},
    {0xB179, &kConnected},
};
// clang-format on

} // namespace

constinit const EventTable kLteEvents{
    .technology = kVoxLogChannelTechnology_Zephra_LTE,
    .name = "LTE",
    .cells = kCells,
    .values = kValues,
    .rrcStates = kStates,
};

} // namespace kestrum
