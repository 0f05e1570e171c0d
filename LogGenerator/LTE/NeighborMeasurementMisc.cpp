#include "LogGenerator/LTE/NeighborMeasurementMisc.h"

#include "LogGenerator/LTE/Conversions.h"

namespace kestrum {
namespace {

constexpr std::size_t kMinimumLength = 21;

// clang-format off
constexpr Row kLayout[] = {
    {u8(13),             "Version",   decimal},
    {u16(17),            "E-ARFCN",   decimal},
    {u16(19).bits(0, 5), "Qrxlevmin", inWholeDbm<qrxlevmin>},
};
// clang-format on
static_assert(reach(kLayout) == kMinimumLength);

} // namespace

std::string_view NeighborMeasurementMisc::getSectionName() const
{
    return "Neighbor Measurements";
}

std::vector<LogCode> NeighborMeasurementMisc::getLogCodeArray() const
{
    return {0xB180};
}

void NeighborMeasurementMisc::updateWithData(Record data, LogCode logCode)
{
    if (accepts(data, logCode, 0xB180, kMinimumLength))
        publish(data, kLayout);
}

} // namespace kestrum
