#include "LogGenerator/UTRAN/TRCHBLERMeasurement.h"

namespace kestrum {
namespace {

constexpr Field kCount = u16(14).bits(6, 11);
constexpr Elements kChannels{17, 2};
// clang-format off
constexpr Row kChannel[] = {
    {u8(0), "TRCH ID",               decimalSigned32},
    {u8(1), "TRCH BLER Measurement", decimalSigned32},
};
// clang-format on

constexpr Layout kLayouts[] = {
    {.code = 0xD00C, .minimumLength = 17, .rows = kChannel, .list = {{kCount, kChannels}}},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "TRCH BLER",
    .layouts = kLayouts,
    .entryLine = "TRCH BLER Measurement",
    .entryPriority = Priority::Notice,
    .foreignCode = ForeignCode::Ignored,
};

} // namespace

TRCHBLERMeasurement::TRCHBLERMeasurement(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

} // namespace kestrum
