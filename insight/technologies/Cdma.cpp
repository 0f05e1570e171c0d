// CDMA2000: 1x for calls and EV-DO for data, each with a serving cell.
#include "insight/EventTables.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

constexpr LogCode kEvdoStatus = 0x1183, kOneXStatus = 0x119C, kIdentity = 0x134F;

constexpr std::string_view kTraffic = "Traffic [8]";

/// An idle phone sleeps and wakes up several times a second: that is no event.
std::string_view callState(std::string_view text)
{
    const bool isIdle = text == "Paging [6]" || text == "Slotted mode sleep state [7]" || text == "Slew [5]" ||
                        text == "UnSlew [9]" || text == "Operation in PCG state [10]";
    return isIdle ? "Idle" : text;
}

// clang-format off
constexpr CellPart kOneXCell[] = {
    {"base station", {"System/Base Station ID", kIdentity}},
    {"SID",          {"System/System ID",       kIdentity}},
    {"NID",          {"System/Network ID",      kIdentity}},
};
constexpr Place kOneXPower[] = {{"1x/Radio/Rx0 AGC", kOneXStatus}};
constexpr CellLevel kOneXLevels[] = {{"Rx0 AGC", kOneXPower}};
constexpr Place kOneXState = {"1x/Device State", kOneXStatus};
constexpr std::string_view kOneXInUse[] = {kTraffic};

constexpr CellPart kEvdoCell[] = {
    {"PN",      {"EV-DO/Radio/Serving PN Offset", kEvdoStatus}},
    {"channel", {"EV-DO/Radio/Channel",           kEvdoStatus}},
};
constexpr Place kEvdoPower[] = {{"EV-DO/Radio/Rx0 AGC", kEvdoStatus}};
constexpr CellLevel kEvdoLevels[] = {{"Rx0 AGC", kEvdoPower}};
constexpr Place kEvdoState = {"EV-DO/State/Device State", kEvdoStatus};
constexpr std::string_view kEvdoInUse[] = {"Connected [5]"};

constexpr ServingCellTable kCells[] = {
    {.radio = "1x", .identity = kOneXCell, .decisive = 3, .levels = kOneXLevels, .state = kOneXState,
     .connected = kOneXInUse},
    {.radio = "EV-DO", .identity = kEvdoCell, .decisive = 2, .levels = kEvdoLevels, .state = kEvdoState,
     .connected = kEvdoInUse},
};

constexpr Place kSystem[] = {{"System/System ID", kIdentity}, {"System/Network ID", kIdentity},
                             {"System/Packet Zone ID", kIdentity}};
constexpr Place kRoaming[] = {{"System/Roaming", kIdentity}};
constexpr Place kSession[] = {{"EV-DO/State/Session State", kEvdoStatus}};
constexpr Place kColor[] = {{"EV-DO/State/Color Code", kEvdoStatus}};
constexpr Place kCall[] = {kOneXState}, kData[] = {kEvdoState};

constexpr FollowedValue kValues[] = {
    {EventKind::Registration, "system, network, zone", kSystem},
    {EventKind::Registration, "roaming",               kRoaming},
    {EventKind::Registration, "EV-DO color code",      kColor},
    {EventKind::Call,         "1x device state",       kCall, callState},
    {EventKind::Data,         "EV-DO device state",    kData},
    {EventKind::Data,         "EV-DO session",         kSession},
};
// clang-format on

} // namespace

constinit const EventTable kCdmaEvents{
    .technology = kVoxLogChannelTechnology_Zephra_CDMA,
    .name = "CDMA2000",
    .cells = kCells,
    .values = kValues,
};

} // namespace kestrum
