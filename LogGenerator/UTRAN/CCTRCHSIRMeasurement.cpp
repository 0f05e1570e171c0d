#include "LogGenerator/UTRAN/CCTRCHSIRMeasurement.h"

namespace kestrum {
namespace {

constexpr std::size_t kMinimumLength = 17;

constexpr Field kTransportChannels = u16(14).bits(6, 11);
constexpr Field kCount = u16(14).bits(12, 15);

/// The entries stand behind a block of 34 bytes for each transport channel.
constexpr Elements entries(std::size_t transportChannels)
{
    return {289 + 34 * transportChannels, 8};
}

// clang-format off
constexpr Row kEntry[] = {
    {u8(0), "CCTRCH ID", decimal},
    {u8(1), "TSNUM",     decimal},
};
// clang-format on
constexpr Elements kSirs{2, 1};
constexpr std::size_t kSirCount = 6;
static_assert(kSirs.first + kSirs.stride * kSirCount == entries(0).length);

std::string sir(Record entry)
{
    return decimal(entry.read(u8(0)).value_or(0));
}

void showEntry(Record entry, Dictionary& row)
{
    show(entry, kEntry, row);
    listed(entry, kSirs, kSirCount, sir)(row.slot("SIR").becomeArray());
}

} // namespace

std::string_view CCTRCHSIRMeasurement::getSectionName() const
{
    return "CCTRCH SIR";
}

std::vector<LogCode> CCTRCHSIRMeasurement::getLogCodeArray() const
{
    return {0xD00C};
}

void CCTRCHSIRMeasurement::updateWithData(Record data, LogCode logCode)
{
    if (!accepts(data, logCode, 0xD00C, kMinimumLength, Foreign::Ignored))
        return;
    clearElementsInArray(sectionRef);
    const auto channels = data.read(kTransportChannels).value_or(0);
    replaceArray(sectionRef, listed(data, entries(channels), data.read(kCount).value_or(0), showEntry));
}

} // namespace kestrum
