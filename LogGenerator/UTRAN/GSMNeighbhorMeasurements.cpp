#include "LogGenerator/UTRAN/GSMNeighbhorMeasurements.h"

namespace kestrum {
namespace {

constexpr Layout kLayouts[] = {
    {.code = 0xD00E, .minimumLength = 17},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "GSM Neighbor Cell List",
    .layouts = kLayouts,
    .foreignCode = ForeignCode::Ignored,
};

} // namespace

GSMNeighbhorMeasurements::GSMNeighbhorMeasurements(DecodingRoles& decodingRoles)
    : PlaceholderList(decodingRoles, kTraits)
{}

} // namespace kestrum
