#include "LogGenerator/ZPH_GSM/UMTSRRMeasurement.h"

namespace kestrum {
namespace {

constexpr SectionTraits kTraits{
    .name = "UMTS RR Measurement",
    .entryLine = "UMTSRRMeasurement",
    .foreignCode = ForeignCode::Ignored,
};

} // namespace

UMTSRRMeasurement::UMTSRRMeasurement(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

} // namespace kestrum
