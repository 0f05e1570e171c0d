#include "LogGenerator/LTE/NeighborMeasurementMisc.h"

#include "LogGenerator/LTE/Quantities.h"

namespace kestrum {
namespace {

// clang-format off
constexpr Row kRows[] = {
    {u8(13),             "Version",   decimalSigned32},
    {u16(17),            "E-ARFCN",   decimalSigned32},
    {u16(19).bits(0, 5), "Qrxlevmin", inWholeDbm<qrxlevmin>},
};
// clang-format on

constexpr Layout kLayouts[] = {
    {.code = 0xB180, .minimumLength = 21, .rows = kRows},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Neighbor Measurements",
    .layouts = kLayouts,
};

} // namespace

NeighborMeasurementMisc::NeighborMeasurementMisc(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

} // namespace kestrum
