#include "LogGenerator/ZPH_GSM/ProcessPS.h"

#include "LogGenerator/ZPH_GSM/NasStates.h"

namespace kestrum {
namespace {

std::string_view gmmState(std::uint32_t raw)
{
    static constexpr std::string_view kNames[] = {
        "GMM_NULL",
        "GMM_DEREGISTERED",
        "GMM_REGISTERED_INITIATED",
        "GMM_REGISTERED",
        "GMM_DEREGISTERED_INITIATED",
        "GMM_ROUTING_AREA_UPDATE_INITIATED",
        "GMM_SERVICE_REQUEST_INITIATED",
    };
    return nameIn(kNames, raw);
}

std::string_view gmmSubstate(std::uint32_t raw)
{
    static constexpr std::string_view kNames[] = {
        "GMM_NORMAL_SERVICE",
        "GMM_LIMITED_SERVICE",
        "GMM_ATTACH_NEEDED",
        "GMM_ATTEMPTING_TO_ATTACH",
        "GMM_NO_IMSI",
        "GMM_NO_CELL_AVAILABLE",
        "GMM_PLMN_SEARCH",
        "GMM_SUSPENDED",
        "GMM_UPDATE_NEEDED",
        "GMM_ATTEMPING_TO_UPDATE", // kept: the modem's spelling
        "GMM_ATTEMPTING_TO_UPDATE_MM",
        "GMM_IMSI_DETACH_INITIATED",
        "GMM_NULL_SUBSTATE",
    };
    return nameIn(kNames, raw);
}

std::string_view updateStatus(std::uint32_t raw)
{
    static constexpr std::string_view kNames[] = {
        "GMM_GU1_UPDATED",
        "GMM_GU2_NOT_UPDATED",
        "GMM_GU3_PLMN_NOT_ALLOWED",
        "GMM_GU3_ROUTING_AREA_NOT_ALLOWED",
    };
    return nameIn(kNames, raw);
}

// Kept: the keys are those of circuit-switched mobility management.
// clang-format off
constexpr Row kMobilityManagement[] = {
    {u8(13), "MM State",            named<gmmState>},
    {u8(14), "MM Sub State",        named<gmmSubstate>},
    {u8(15), "Attach Reject Cause", named<updateStatus>},
};
// clang-format on

constexpr Layout kLayouts[] = {
    {.code = nas::kGmmState, .minimumLength = nas::kMinimumLength, .rows = kMobilityManagement},
    {.code = nas::kRegistration, .minimumLength = nas::kMinimumLength, .rows = nas::kServiceState},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Process PS",
    .layouts = kLayouts,
    .entryLine = "ProcessPS",
};

} // namespace

ProcessPS::ProcessPS(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

} // namespace kestrum
