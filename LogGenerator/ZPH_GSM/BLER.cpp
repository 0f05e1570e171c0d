#include "LogGenerator/ZPH_GSM/BLER.h"

namespace kestrum {
namespace {

constexpr LogCode kCode = 0x4116;
constexpr std::size_t kMinimumLength = 16;

constexpr Row kWindow[] = {{u16(14), "Window Size", decimal}};
constexpr Field kCount = u8(13);
constexpr Elements kChannels{16, 9};
// clang-format off
constexpr Row kChannel[] = {
    {u8(0),  "Transport Channel ID",  decimal},
    {u32(1), "CRC Received",          decimal},
    {u32(5), "CRC Received in Error", decimal},
};
// clang-format on
static_assert(reach(kWindow) <= kMinimumLength && reach(kChannel) == kChannels.length);

} // namespace

std::string_view BLER::getSectionName() const
{
    return "BLER";
}

std::vector<LogCode> BLER::getLogCodeArray() const
{
    return {kCode};
}

void BLER::updateWithData(Record data, LogCode logCode)
{
    if (!accepts(data, logCode, kCode, kMinimumLength))
        return;
    publish(data, kWindow);
    publish("Transport Channels", listed(data, kChannels, data.read(kCount).value_or(0), kChannel));
}

} // namespace kestrum
