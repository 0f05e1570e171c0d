#include "LogGenerator/ZPH_GSM/MobileAllocation.h"

namespace kestrum {
namespace {

constexpr LogCode kCode = 0x51F8;
constexpr std::size_t kMinimumLength = 15;

constexpr Row kHopping[] = {{u8(13), "HSN", decimal}};
constexpr Field kCount = u8(14);
constexpr Elements kArfcns{15, 2};

std::string arfcn(Record entry)
{
    return decimal(entry.read(u16(0)).value_or(0));
}

} // namespace

std::string_view MobileAllocation::getSectionName() const
{
    return "Mobile Allocation";
}

std::vector<LogCode> MobileAllocation::getLogCodeArray() const
{
    return {kCode};
}

void MobileAllocation::updateWithData(Record data, LogCode logCode)
{
    if (!accepts(data, logCode, kCode, kMinimumLength))
        return;
    publish(data, kHopping);
    publish("ARFCNs", listed(data, kArfcns, data.read(kCount).value_or(0), arfcn));
}

} // namespace kestrum
