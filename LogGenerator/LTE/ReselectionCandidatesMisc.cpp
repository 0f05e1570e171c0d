#include "LogGenerator/LTE/ReselectionCandidatesMisc.h"

namespace kestrum {
namespace {

// clang-format off
constexpr Row kRows[] = {
    {u8(13),  "Version",         decimalSigned32},
    {u16(15), "Serving EARFCN",  decimalSigned32},
    {u16(17), "Serving Cell ID", decimalSigned32},
};
// clang-format on

constexpr Layout kLayouts[] = {
    {.code = 0xB186, .minimumLength = 21, .rows = kRows},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Reselection Candidates",
    .layouts = kLayouts,
};

} // namespace

ReselectionCandidatesMisc::ReselectionCandidatesMisc(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

} // namespace kestrum
