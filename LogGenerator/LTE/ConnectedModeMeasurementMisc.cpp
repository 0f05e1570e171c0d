#include "LogGenerator/LTE/ConnectedModeMeasurementMisc.h"

#include "LogGenerator/LTE/Conversions.h"

namespace kestrum {
namespace {

constexpr std::size_t kMinimumLength = 29;

// clang-format off
constexpr Row kLayout[] = {
    {u16(17), "E-ARFCN",                  decimal},
    {u16(19), "Serving Physical Cell ID", decimal},
    {u16(21), "Subframe Number",          decimal},
    {u16(23), "Serving Filtered RSRP",    inDbm<rsrpQuarterDb>},
    {u16(25), "Serving Filtered RSRQ",    inDb<rsrqEighthDb>},
};
// clang-format on
static_assert(reach(kLayout) <= kMinimumLength);

} // namespace

std::string_view ConnectedModeMeasurementMisc::getSectionName() const
{
    return "Connected mode LTE Intra-frequency Measurement";
}

std::vector<LogCode> ConnectedModeMeasurementMisc::getLogCodeArray() const
{
    return {0xB179};
}

void ConnectedModeMeasurementMisc::updateWithData(Record data, LogCode logCode)
{
    if (accepts(data, logCode, 0xB179, kMinimumLength))
        publish(data, kLayout);
}

} // namespace kestrum
