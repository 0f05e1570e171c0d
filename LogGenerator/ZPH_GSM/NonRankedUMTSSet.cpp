#include "LogGenerator/ZPH_GSM/NonRankedUMTSSet.h"

namespace kestrum {
namespace {

constexpr SectionTraits kTraits{
    .name = "Non-Ranked UMTS Set",
    .entryLine = "NonRankedUMTSSet",
    .foreignCode = ForeignCode::Ignored,
};

} // namespace

NonRankedUMTSSet::NonRankedUMTSSet(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

} // namespace kestrum
