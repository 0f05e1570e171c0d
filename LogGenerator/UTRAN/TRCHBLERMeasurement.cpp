#include "LogGenerator/UTRAN/TRCHBLERMeasurement.h"

namespace kestrum {
namespace {

constexpr std::size_t kMinimumLength = 17;

constexpr Field kCount = u16(14).bits(6, 11);
constexpr Elements kChannels{17, 2};
// clang-format off
constexpr Row kChannel[] = {
    {u8(0), "TRCH ID",               decimal},
    {u8(1), "TRCH BLER Measurement", decimal},
};
// clang-format on
static_assert(reach(kChannel) == kChannels.length);

} // namespace

std::string_view TRCHBLERMeasurement::getSectionName() const
{
    return "TRCH BLER";
}

std::vector<LogCode> TRCHBLERMeasurement::getLogCodeArray() const
{
    return {0xD00C};
}

void TRCHBLERMeasurement::updateWithData(Record data, LogCode logCode)
{
    if (!accepts(data, logCode, 0xD00C, kMinimumLength, Foreign::Ignored))
        return;
    clearElementsInArray(sectionRef);
    replaceArray(sectionRef, listed(data, kChannels, data.read(kCount).value_or(0), kChannel));
}

} // namespace kestrum
