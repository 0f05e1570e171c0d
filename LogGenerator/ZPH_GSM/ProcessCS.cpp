#include "LogGenerator/ZPH_GSM/ProcessCS.h"

#include "LogGenerator/ZPH_GSM/NasStates.h"

namespace kestrum {
namespace {

std::string_view mmSubstate(std::uint32_t raw)
{
    static constexpr std::string_view kNames[] = {
        "MM_NULL_SUBSTATE",        "MM_NO_IMSI",
        "MM_PLMN_SEARCH",          "MM_LIMITED_SERVICE",
        "MM_ATTEMPTING_TO_UPDATE", "MM_LOCATION_UPDATE_NEEDED",
        "MM_NO_CELL_AVAILABLE",    "MM_PLMN_SEARCH_NORMAL_SERVICE",
        "MM_NORMAL_SERVICE",
    };
    return nameIn(kNames, raw);
}

std::string_view updateStatus(std::uint32_t raw)
{
    static constexpr std::string_view kNames[] = {
        "UPDATED",
        "NOT_UPDATED",
        "ROAMING_NOT_ALLOWED",
        "LOCATION_AREA_NOT_ALLOWED",
    };
    return nameIn(kNames, raw);
}

// clang-format off
constexpr Row kMobilityManagement[] = {
    {u8(13), "MM State",        nas::mmState},
    {u8(14), "MM Sub State",    mmSubstate},
    {u8(15), "LU Reject Cause", updateStatus}, // shows the status, on purpose
};
constexpr Layout kLayouts[] = {
    {nas::kMmState,      nas::kMinimumLength, kMobilityManagement},
    {nas::kRegistration, nas::kMinimumLength, nas::kServiceState},
};
// clang-format on
static_assert(rowsFit(kLayouts));

} // namespace

std::string_view ProcessCS::getSectionName() const
{
    return "Process CS";
}

std::vector<LogCode> ProcessCS::getLogCodeArray() const
{
    return codesOf(kLayouts);
}

void ProcessCS::updateWithData(Record data, LogCode logCode)
{
    logEntry();
    if (!publish(data, logCode, kLayouts))
        reportUnknown(logCode);
}

} // namespace kestrum
