#include "LogGenerator/LTE/ServingCellMeasurement.h"

#include "LogGenerator/LTE/Quantities.h"

namespace kestrum {
namespace {

constexpr int power(std::uint32_t raw)
{
    return static_cast<int>(raw) - 30;
}

/// Search thresholds are sent in steps of 2 dB.
constexpr int threshold(std::uint32_t raw)
{
    return 2 * static_cast<int>(raw);
}

std::string_view notPresent(std::uint32_t)
{
    return "Not Present";
}

template <std::uint32_t Absent, const Quantity& Ordinary>
constexpr const Quantity& kOrAbsent = exceptFor<isValue<Absent>, notPresent, Ordinary>;

std::string_view trueOrFalse(std::uint32_t raw)
{
    return raw != 0 ? "True" : "False";
}

// clang-format off
constexpr Row kRows[] = {
    {u8(13),               "Version",                               decimalSigned32},
    {u16(17),              "E-ARFCN",                               decimalSigned32},
    {u16(19).bits(0, 8),   "Physical Cell ID",                      decimalSigned32},
    {u16(19).bits(9, 12),  "Serving Layer Priority",                decimalSigned32},
    {u32(21).bits(0, 8),   "Measured RSRP",                         inDbm<rsrpQuarterDb>},
    {u32(21).bits(9, 17),  "Average RSRP",                          inDbm<rsrpQuarterDb>},
    {u32(21).bits(18, 24), "Measured RSRQ",                         inDb<rsrqQuarterDb>},
    {u32(21).bits(25, 31), "Average RSRQ",                          inDb<rsrqQuarterDb>},
    {u32(25).bits(0, 8),   "Measured RSSI",                         inDbm<powerHalfDb>},
    {u32(25).bits(9, 14),  "Qrxlevmin",                             inWholeDbm<qrxlevmin>},
    {u32(25).bits(15, 21), "P_Max",                                 kOrAbsent<64, inWholeDbm<power>>},
    // Kept: the field has six bits, so it never holds 64, the value for "absent".
    {u32(25).bits(22, 27), "Max UE Tx Power",                       kOrAbsent<64, inWholeDbm<power>>},
    // Kept: a ratio, shown in dBm.
    {u32(29).bits(0, 6),   "Srxlev",                                inWholeDbm<srxlev>},
    {u32(29).bits(7, 12),  "Num of Consecutive DRX Cycles of S < 0", decimalSigned32},
    {u32(29).bits(13, 18), "S Intra Search",                        kOrAbsent<32, inWholeDb<threshold>>},
    // Kept: a ratio like the other threshold, shown in dBm.
    {u32(29).bits(19, 24), "S Non Intra Search",                    kOrAbsent<32, inWholeDbm<threshold>>},
    {u32(29).bit(25),      "Measurement Rules Updated",             named<trueOrFalse>},
    {u32(29).bits(26, 29), "Measurement Rules",                     decimalSigned32},
};
// clang-format on

constexpr Layout kLayouts[] = {
    {.code = 0xB17F, .minimumLength = 33, .rows = kRows},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Serving Cell Measurements",
    .layouts = kLayouts,
};

} // namespace

ServingCellMeasurement::ServingCellMeasurement(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

} // namespace kestrum
