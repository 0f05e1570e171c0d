// UTRA TDD.
#include "insight/EventTables.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

// clang-format off
constexpr CellPart kCell[] = {
    {"cell",   {"Serving Cell/Serving Cell Info/Cell ID"}}, // with the RNC's identity (3GPP TS 25.331)
    {"UARFCN", {"Serving Cell/Serving Cell Info/Downlink UARFCN"}},
};
// The active set comes first in the list.
constexpr Place kPower[] = {{"Neighbors/Neighbor Cell List/0/Filter RSCP"}};
constexpr CellLevel kLevels[] = {{"RSCP", kPower}};

constexpr Place kState = {"Serving Cell/RRC Info/State"};
constexpr std::string_view kInUse[] = {"Cell DCH"};

constexpr ServingCellTable kCells[] = {
    {.radio = "TD-SCDMA", .identity = kCell, .decisive = 1, .levels = kLevels, .state = kState, .connected = kInUse},
};

constexpr Place kRrc[] = {kState};
constexpr Place kArea[] = {{"Serving Cell/Serving Cell Info/Local Area Code"}};
constexpr Place kRegistrationArea[] = {{"Serving Cell/Serving Cell Info/URA ID"}};
constexpr Place kContexts[] = {{"Subscription and Data/PDP Context Info/*/Access Point Name"}};

constexpr FollowedValue kValues[] = {
    {EventKind::RrcState,     "RRC state",               kRrc},
    {EventKind::Registration, "location area",           kArea},
    {EventKind::Registration, "UTRAN registration area", kRegistrationArea},
    {EventKind::Data,         "access points",           kContexts},
};
// clang-format on

} // namespace

constinit const EventTable kUtranEvents{
    .technology = kVoxLogChannelTechnology_Zephra_UTRAN2,
    .name = "TD-SCDMA",
    .cells = kCells,
    .values = kValues,
};

} // namespace kestrum
