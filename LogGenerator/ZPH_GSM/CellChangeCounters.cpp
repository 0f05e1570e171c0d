#include "LogGenerator/ZPH_GSM/CellChangeCounters.h"

namespace kestrum {
namespace {

constexpr SectionTraits kTraits{
    .name = "Cell Change Counters",
    .entryLine = "CellChangeCounters",
    .foreignCode = ForeignCode::Ignored,
};

} // namespace

CellChangeCounters::CellChangeCounters(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

} // namespace kestrum
