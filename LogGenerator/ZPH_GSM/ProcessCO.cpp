#include "LogGenerator/ZPH_GSM/ProcessCO.h"

#include "LogGenerator/ZPH_GSM/NasStates.h"

namespace kestrum {
namespace {

constexpr Row kMobilityManagement[] = {{u8(13), "MM State", named<nas::mmState>}};
// clang-format off
// clang-format on

constexpr Layout kLayouts[] = {
    {.code = nas::kMmState, .minimumLength = nas::kMinimumLength, .rows = kMobilityManagement},
    {.code = nas::kRegistration, .minimumLength = nas::kMinimumLength, .rows = nas::kServiceState},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Process CO",
    .layouts = kLayouts,
    // Kept: the text of another section.
    .entryLine = "ProcessCS",
};

} // namespace

ProcessCO::ProcessCO(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

} // namespace kestrum
