#include "LogGenerator/ZPH_GSM/UMTSRRMeasurement.h"

namespace kestrum {

std::string_view UMTSRRMeasurement::getSectionName() const
{
    return "UMTS RR Measurement";
}

std::vector<LogCode> UMTSRRMeasurement::getLogCodeArray() const
{
    return {};
}

void UMTSRRMeasurement::updateWithData(Record, LogCode)
{
    logEntry();
}

} // namespace kestrum
