#include "LogGenerator/LTE/ConnectedModeMeasurementMisc.h"

#include "LogGenerator/LTE/Quantities.h"

namespace kestrum {
namespace {

// clang-format off
constexpr Row kRows[] = {
    {u16(17), "E-ARFCN",                  decimalSigned32},
    {u16(19), "Serving Physical Cell ID", decimalSigned32},
    {u16(21), "Subframe Number",          decimalSigned32},
    {u16(23), "Serving Filtered RSRP",    inDbm<rsrpQuarterDb>},
    {u16(25), "Serving Filtered RSRQ",    inDb<rsrqEighthDb>},
};
// clang-format on

constexpr Layout kLayouts[] = {
    {.code = 0xB179, .minimumLength = 29, .rows = kRows},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Connected mode LTE Intra-frequency Measurement",
    .layouts = kLayouts,
};

} // namespace

ConnectedModeMeasurementMisc::ConnectedModeMeasurementMisc(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits)
{}

} // namespace kestrum
