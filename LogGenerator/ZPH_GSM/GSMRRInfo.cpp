#include "LogGenerator/ZPH_GSM/GSMRRInfo.h"

namespace kestrum {
namespace {

std::string_view rrState(std::uint32_t raw)
{
    // Blanks inside a name are its own.
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

std::string seconds(std::uint32_t raw)
{
    return formatted("%d sec", static_cast<std::int32_t>(raw));
}

// clang-format off
constexpr Row kState[] = {
    {u8(13),  "RR State",         rrState},
    {u8(14),  "RR Sub State",     decimal},
    {u8(15),  "RR Status",        decimal},
    {u8(16),  "RR Mode",          rrMode},
};
constexpr Row kMeasurements[] = {
    {u8(15),  "Serving Rx Level", decimal},
    {u32(16), "Rx Quality Full",  decimal},
    {u32(20), "Rx Quality Sub",   decimal},
};
constexpr Row kTransmission[] = {
    {u8(19),  "DTX Used",         onOrOff},
};
constexpr Row kTimers[] = {
    {u8(16),  "DRX Used",         seconds},
};

constexpr Layout kLayouts[] = {
    {0x512C, 17, kState},
    {0x5137, 29, kMeasurements},
    {0x5072, 20, kTransmission},
    {0x51F6, 24, kTimers},
};
// clang-format on
static_assert(rowsFit(kLayouts));

} // namespace

std::string_view GSMRRInfo::getSectionName() const
{
    return "GSM RR Info";
}

std::vector<LogCode> GSMRRInfo::getLogCodeArray() const
{
    return codesOf(kLayouts);
}

void GSMRRInfo::updateWithData(Record data, LogCode logCode)
{
    logEntry();
    if (!publish(data, logCode, kLayouts))
        reportUnknown(logCode);
}

} // namespace kestrum
