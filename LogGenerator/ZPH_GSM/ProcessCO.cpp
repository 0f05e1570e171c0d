#include "LogGenerator/ZPH_GSM/ProcessCO.h"

#include "LogGenerator/ZPH_GSM/NasStates.h"

namespace kestrum {
namespace {

constexpr Row kMobilityManagement[] = {{u8(13), "MM State", nas::mmState}};
// clang-format off
constexpr Layout kLayouts[] = {
    {nas::kMmState,      nas::kMinimumLength, kMobilityManagement},
    {nas::kRegistration, nas::kMinimumLength, nas::kServiceState},
};
// clang-format on
static_assert(rowsFit(kLayouts));

} // namespace

std::string_view ProcessCO::getSectionName() const
{
    return "Process CO";
}

std::vector<LogCode> ProcessCO::getLogCodeArray() const
{
    return codesOf(kLayouts);
}

void ProcessCO::updateWithData(Record data, LogCode logCode)
{
    logEntry();
    if (!publish(data, logCode, kLayouts))
        reportUnknown(logCode);
}

} // namespace kestrum
