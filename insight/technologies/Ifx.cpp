// A modem that sends whole trees of texts.
#include "insight/EventTables.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

// clang-format off
constexpr CellPart kCell[] = {
    {"cell",  {"Serving Cell/Cell ID"}},
    {"LAC",   {"Serving Cell/LAC"}},
    {"ARFCN", {"Serving Cell/ARFCN"}},
    {"BSIC",  {"Serving Cell/BSIC"}},
};
constexpr Place kPower[] = {{"Serving Cell/RSSI"}};
constexpr CellLevel kLevels[] = {{"RSSI", kPower}};
constexpr Place kState = {"Radio Resource/Status/State"};
constexpr std::string_view kInUse[] = {"Dedicated"};

constexpr ServingCellTable kCells[] = {
    {.radio = "GSM", .identity = kCell, .decisive = 2, .levels = kLevels, .state = kState, .connected = kInUse},
};

constexpr Place kRr[] = {kState};
constexpr Place kArea[] = {{"Mobility Management/Location Area"}};
constexpr Place kMobility[] = {{"Mobility Management/MM State"}};
constexpr Place kPacketMobility[] = {{"Mobility Management/GMM State"}};
constexpr Place kContexts[] = {{"Packet Data/PDP Contexts/*/APN"}};

constexpr FollowedValue kValues[] = {
    {EventKind::RrcState,     "RR state",            kRr},
    {EventKind::Registration, "location area",       kArea},
    {EventKind::Call,         "mobility management", kMobility},
    {EventKind::Data,         "GPRS mobility",       kPacketMobility},
    {EventKind::Data,         "access points",       kContexts},
};

// The tree of the machine's own modem. Which keys identify a cell depends on its technology.
constexpr Place kLiveCell[] = {
    {"Serving Cell/Technology"},      {"Serving Cell/Cell Identity"}, {"Serving Cell/Physical Cell ID"},
    {"Serving Cell/Scrambling Code"}, {"Serving Cell/E-ARFCN"},       {"Serving Cell/NR-ARFCN"},
};
constexpr Place kAccess[] = {{"Registration/Access Technology"}};
constexpr Place kRegistration[] = {{"Registration/Registration State"}};
constexpr Place kTrackingArea[] = {{"Serving Cell/Tracking Area Code"}};
constexpr Place kModem[] = {{"Modem/State"}};

constexpr FollowedValue kLiveModemValues[] = {
    {EventKind::ServingCell,  "serving cell",        kLiveCell},
    {EventKind::Technology,   "access technology",   kAccess},
    {EventKind::Registration, "registration",        kRegistration},
    {EventKind::Registration, "tracking area",       kTrackingArea},
    {EventKind::Data,         "modem",               kModem},
};
// clang-format on

} // namespace

constinit const EventTable kIfxEvents{
    .technology = kVoxLogChannelTechnology_IFX,
    .name = "IFX",
    .cells = kCells,
    .values = kValues,
    .liveModemValues = kLiveModemValues,
};

} // namespace kestrum
