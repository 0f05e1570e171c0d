#include "LogGenerator/ZPH_GSM/UMTSSet.h"

#include "LogGenerator/CellMonitor.h"
#include "LogGenerator/ZPH_GSM/ReselectionRanking.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

constexpr LogCode kCellMonitor = 0xFF0001;

constexpr Field kCount = u8(13);
constexpr Elements kRanked{ranking::kFirstCell, 10};

std::string rscp(std::uint32_t raw)
{
    return formatted("%d dB", static_cast<std::int8_t>(raw) - 21);
}

std::string rankedRscp(std::uint32_t raw)
{
    return formatted("%d dB", static_cast<std::int16_t>(raw));
}

std::string halfDb(std::uint32_t raw)
{
    return formatted("%f dB", static_cast<std::int8_t>(raw) * 0.5);
}

// clang-format off
constexpr Row kRankedCell[] = {
    {u16(2), "Scrambling Code",    decimal},
    {u8(4),  "RSCP",               rscp},
    {u8(7),  "Energy Per Chip",    halfDb},
    {u16(0), "Downlink Frequency", decimalSigned16},
    {u16(8), "Ranking Value",      decimalSigned16},
    {u16(5), "Rank Cell RSCP",     rankedRscp},
};
// clang-format on
static_assert(reach(kRankedCell) == kRanked.length);

constexpr std::int16_t kNotMeasured = 32767;

std::string monitoredRscp(std::uint32_t raw)
{
    const auto value = static_cast<std::int16_t>(raw);
    return value == kNotMeasured ? "" : formatted("%d dBm", value);
}

std::string monitoredEcNo(std::uint32_t raw)
{
    const auto value = static_cast<std::int16_t>(raw);
    return value == kNotMeasured ? "" : formatted("%d dB", value);
}

// clang-format off
constexpr CellRow kMonitoredCell[] = {
    {kVoxCell_UARFCN,         "UARFCN",          "UMTSSet: Failed to retrieve UARFCN\n"},
    {kVoxCell_ScramblingCode, "Scrambling Code", "UMTSSet: Failed to retrieve Scrambling Code\n"},
    {kVoxCell_RSCP,           "RSCP",            "UMTSSet: Failed to retrieve RSCP\n",            monitoredRscp},
    {kVoxCell_EcNo,           "Energy Per Chip", "UMTSSet: Failed to retrieve Energy Per Chip\n", monitoredEcNo},
};
// clang-format on

} // namespace

std::string_view UMTSSet::getSectionName() const
{
    return "UMTS Set";
}

std::vector<LogCode> UMTSSet::getLogCodeArray() const
{
    return {ranking::kCode, kCellMonitor};
}

void UMTSSet::updateWithData(Record data, LogCode logCode)
{
    if (logCode == kCellMonitor) {
        logEntry();
        replaceArray(sectionRef,
                     [&](Array& list) { appendNeighbors(list, data, kVoxCellTechnology_UMTS, kMonitoredCell, roles); });
    } else if (accepts(data, logCode, ranking::kCode, ranking::kMinimumLength)) {
        replaceArray(sectionRef, listed(data, kRanked, data.read(kCount).value_or(0), kRankedCell));
    }
}

} // namespace kestrum
