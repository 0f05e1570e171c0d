#include "LogGenerator/ZPH_GSM/CodingScheme.h"

namespace kestrum {
namespace {

constexpr SectionTraits kTraits{
    .name = "Coding Scheme",
    // Kept: the text of another section.
    .entryLine = "CellChangeCounters",
    .foreignCode = ForeignCode::Ignored,
};

} // namespace

CodingScheme::CodingScheme(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

} // namespace kestrum
