#include "LogGenerator/LTE/ReselectionCandidatesMisc.h"

namespace kestrum {
namespace {

constexpr std::size_t kMinimumLength = 21;

// clang-format off
constexpr Row kLayout[] = {
    {u8(13),  "Version",         decimal},
    {u16(15), "Serving EARFCN",  decimal},
    {u16(17), "Serving Cell ID", decimal},
};
// clang-format on
static_assert(reach(kLayout) <= kMinimumLength);

} // namespace

std::string_view ReselectionCandidatesMisc::getSectionName() const
{
    return "Reselection Candidates";
}

std::vector<LogCode> ReselectionCandidatesMisc::getLogCodeArray() const
{
    return {0xB186};
}

void ReselectionCandidatesMisc::updateWithData(Record data, LogCode logCode)
{
    if (accepts(data, logCode, 0xB186, kMinimumLength))
        publish(data, kLayout);
}

} // namespace kestrum
