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
    {u8(13), "MM State",        named<nas::mmState>},
    {u8(14), "MM Sub State",    named<mmSubstate>},
    {u8(15), "LU Reject Cause", named<updateStatus>}, // kept: shows the update status
};
// clang-format on

constexpr Layout kLayouts[] = {
    {.code = nas::kMmState, .minimumLength = nas::kMinimumLength, .rows = kMobilityManagement},
    {.code = nas::kRegistration, .minimumLength = nas::kMinimumLength, .rows = nas::kServiceState},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Process CS",
    .layouts = kLayouts,
    .entryLine = "ProcessCS",
};

} // namespace

ProcessCS::ProcessCS(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

} // namespace kestrum
