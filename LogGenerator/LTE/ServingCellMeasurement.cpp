#include "LogGenerator/LTE/ServingCellMeasurement.h"

#include "LogGenerator/LTE/Conversions.h"

namespace kestrum {
namespace {

constexpr std::size_t kMinimumLength = 33;

int power(std::uint32_t raw)
{
    return static_cast<int>(raw) - 30;
}

std::string powerOrAbsent(std::uint32_t raw)
{
    return raw == 64 ? "Not Present" : inWholeDbm<power>(raw);
}

/// Search thresholds are sent in steps of 2 dB.
int threshold(std::uint32_t raw)
{
    return 2 * static_cast<int>(raw);
}

std::string intraSearch(std::uint32_t raw)
{
    return raw == 32 ? "Not Present" : formatted("%d dB", threshold(raw));
}

/// A ratio like the other threshold, yet worded as a power, on purpose.
std::string nonIntraSearch(std::uint32_t raw)
{
    return raw == 32 ? "Not Present" : inWholeDbm<threshold>(raw);
}

std::string_view trueOrFalse(std::uint32_t raw)
{
    return raw != 0 ? "True" : "False";
}

// clang-format off
constexpr Row kLayout[] = {
    {u8(13),               "Version",                               decimal},
    {u16(17),              "E-ARFCN",                               decimal},
    {u16(19).bits(0, 8),   "Physical Cell ID",                      decimal},
    {u16(19).bits(9, 12),  "Serving Layer Priority",                decimal},
    {u32(21).bits(0, 8),   "Measured RSRP",                         inDbm<rsrpQuarterDb>},
    {u32(21).bits(9, 17),  "Average RSRP",                          inDbm<rsrpQuarterDb>},
    {u32(21).bits(18, 24), "Measured RSRQ",                         inDb<rsrqQuarterDb>},
    {u32(21).bits(25, 31), "Average RSRQ",                          inDb<rsrqQuarterDb>},
    {u32(25).bits(0, 8),   "Measured RSSI",                         inDbm<powerHalfDb>},
    {u32(25).bits(9, 14),  "Qrxlevmin",                             inWholeDbm<qrxlevmin>},
    {u32(25).bits(15, 21), "P_Max",                                 powerOrAbsent},
    // Six bits never reach the marker for absent, 64. The field is no wider, on purpose.
    {u32(25).bits(22, 27), "Max UE Tx Power",                       powerOrAbsent},
    // A ratio, worded as a power on purpose.
    {u32(29).bits(0, 6),   "Srxlev",                                inWholeDbm<srxlev>},
    {u32(29).bits(7, 12),  "Num of Consecutive DRX Cycles of S < 0", decimal},
    {u32(29).bits(13, 18), "S Intra Search",                        intraSearch},
    {u32(29).bits(19, 24), "S Non Intra Search",                    nonIntraSearch},
    {u32(29).bit(25),      "Measurement Rules Updated",             trueOrFalse},
    {u32(29).bits(26, 29), "Measurement Rules",                     decimal},
};
// clang-format on
static_assert(reach(kLayout) == kMinimumLength);

} // namespace

std::string_view ServingCellMeasurement::getSectionName() const
{
    return "Serving Cell Measurements";
}

std::vector<LogCode> ServingCellMeasurement::getLogCodeArray() const
{
    return {0xB17F};
}

void ServingCellMeasurement::updateWithData(Record data, LogCode logCode)
{
    if (accepts(data, logCode, 0xB17F, kMinimumLength))
        publish(data, kLayout);
}

} // namespace kestrum
