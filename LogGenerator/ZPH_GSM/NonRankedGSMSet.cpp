#include "LogGenerator/ZPH_GSM/NonRankedGSMSet.h"

namespace kestrum {
namespace {

constexpr SectionTraits kTraits{
    .name = "Non-Ranked GSM Set",
    .entryLine = "NonRankedGSMSet",
    .foreignCode = ForeignCode::Ignored,
};

} // namespace

NonRankedGSMSet::NonRankedGSMSet(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

} // namespace kestrum
