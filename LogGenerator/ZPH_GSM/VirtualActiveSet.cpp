#include "LogGenerator/ZPH_GSM/VirtualActiveSet.h"

#include "LogGenerator/ZPH_GSM/SearcherCells.h"

namespace kestrum {
namespace {

constexpr Layout kLayouts[] = {
    {.code = searcher::kCode, .minimumLength = searcher::kMinimumLength},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Virtual Active Set",
    .layouts = kLayouts,
    .entryLine = "VirtualActiveSet",
};

} // namespace

VirtualActiveSet::VirtualActiveSet(DecodingRoles& decodingRoles) : PlaceholderList(decodingRoles, kTraits) {}

} // namespace kestrum
