#include "LogGenerator/ZPH_GSM/DetectedSet.h"

#include "LogGenerator/ZPH_GSM/SearcherCells.h"

namespace kestrum {
namespace {

constexpr Layout kLayouts[] = {
    {.code = searcher::kCode, .minimumLength = searcher::kMinimumLength},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Detected Set",
    .layouts = kLayouts,
    .entryLine = "DetectedSet",
};

} // namespace

DetectedSet::DetectedSet(DecodingRoles& decodingRoles) : PlaceholderList(decodingRoles, kTraits) {}

} // namespace kestrum
