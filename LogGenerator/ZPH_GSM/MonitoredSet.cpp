#include "LogGenerator/ZPH_GSM/MonitoredSet.h"

#include "LogGenerator/ZPH_GSM/SearcherCells.h"

namespace kestrum {
namespace {

constexpr Layout kLayouts[] = {
    {.code = searcher::kCode, .minimumLength = searcher::kMinimumLength},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Monitored Set",
    .layouts = kLayouts,
    .entryLine = "MonitoredSet",
};

} // namespace

MonitoredSet::MonitoredSet(DecodingRoles& decodingRoles) : PlaceholderList(decodingRoles, kTraits) {}

} // namespace kestrum
