#include "LogGenerator/ZPH_GSM/GSMRRInfo.h"

namespace kestrum {
namespace {

std::string_view rrState(std::uint32_t raw)
{
    // Kept: blanks inside a name, as field logs show them.
    static constexpr std::string_view kNames[] = {
        "RR_INACTIVE",
        "RR_GOING_ACTIVE",
        "RR_GOING_INACTIVE",
        "RR_CELL_SELECTION",
        "RR_PLMN_LIST_CONSTRUCTION",
        "RR_IDLE",
        "RR_CELL_RESELECTION",
        "RR_CONNECTION_PENDING",
        "RR_CHOOSE_CELL",
        "RR_DATA_TRANSFER",
        "RR_NO_CHANNELS",
        "RR_CONNECTION_RELEASE",
        "RR_EARLY_CAMPED_WAIT_FOR_SI",
        "RR_W2G_INTERRAT_HANDOVER_ PROGRESS",
        "RR_W2G_INTERRAT_RESELECTION_PROGRESS",
        "RR_WAIT_FOR_EARLY_PSCAN",
        "GRR51",
        "GRR52",
        "RR_G2W_INTERRAT_RESELECTION_PROGRESS",
        "RR_G2W_INTERRAT_HANDOVER_ PROGRESS",
        "RR_CELL_REEST",
        "RR_W2G_INTERRAT_CC_ORDER_ PROGRESS",
    };
    return nameIn(kNames, raw);
}

std::string_view rrMode(std::uint32_t raw)
{
    return raw != 0 ? "Data" : "Voice";
}

std::string_view onOrOff(std::uint32_t raw)
{
    return raw != 0 ? "ON" : "OFF";
}

constexpr Quantity kSeconds{[](Quantity::Raw raw) { return formatted("%d sec", signed32(fieldOf(raw))); },
                            numberOf<signed32>, "sec"};

// clang-format off
constexpr Row kState[] = {
    {u8(13),  "RR State",         named<rrState>},
    {u8(14),  "RR Sub State",     decimalSigned32},
    {u8(15),  "RR Status",        decimalSigned32},
    {u8(16),  "RR Mode",          named<rrMode>},
};
constexpr Row kMeasurements[] = {
    {u8(15),  "Serving Rx Level", decimalSigned32},
    {u32(16), "Rx Quality Full",  decimalSigned32},
    {u32(20), "Rx Quality Sub",   decimalSigned32},
};
constexpr Row kTransmission[] = {
    {u8(19),  "DTX Used",         named<onOrOff>},
};
constexpr Row kTimers[] = {
    {u8(16),  "DRX Used",         kSeconds},
};

// clang-format on

constexpr Layout kLayouts[] = {
    {.code = 0x512C, .minimumLength = 17, .rows = kState},
    {.code = 0x5137, .minimumLength = 29, .rows = kMeasurements},
    {.code = 0x5072, .minimumLength = 20, .rows = kTransmission},
    {.code = 0x51F6, .minimumLength = 24, .rows = kTimers},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "GSM RR Info",
    .layouts = kLayouts,
    .entryLine = "GSMRRInfo",
};

} // namespace

GSMRRInfo::GSMRRInfo(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

} // namespace kestrum
