#include "LogGenerator/ZPH_GSM/UMTSRRInfo.h"

#include "LogGenerator/CellMonitor.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

constexpr LogCode kRrcState = 0x4125, kTransmitPower = 0x4031, kServingCell = 0x4127, kCiphering = 0x4157,
                  kCellMonitor = 0xFF0001;

std::string_view rrcState(std::uint32_t raw)
{
    static constexpr std::string_view kNames[] = {
        "Disconnected", "Connecting", "CELL_FACH", "CELL_DCH", "CELL_PCH", "URA_PCH",
    };
    return nameIn(kNames, raw);
}

std::string_view enabled(std::uint32_t raw)
{
    return raw != 0 ? "Enabled" : "Disabled";
}

// clang-format off
constexpr Row kState[] = {
    {u8(13),  "RRC State",          rrcState},
};
constexpr Row kIdentity[] = {
    {u32(21), "Cell ID",            decimal},
    {u32(17), "Downlink Frequency", decimal},
    {u32(13), "Uplink Frequency",   decimal},
    {u16(25), "URA ID",             decimal},
};
constexpr Row kSecurity[] = {
    {u8(13),  "Ciphering",          enabled},
};

constexpr std::size_t kServingCellLength = 29;
constexpr Layout kLayouts[] = {
    {kRrcState,    14,                 kState},
    {kServingCell, kServingCellLength, kIdentity},
    {kCiphering,   19,                 kSecurity},
};

constexpr CellRow kCell[] = {
    {kVoxCell_CellId,         "Cell ID",         "UMTSRRInfo: Failed to retrieve Cell ID\n"},
    {kVoxCell_UARFCN,         "UARFCN",          "UMTSRRInfo: Failed to retrieve UARFCN\n"},
    {kVoxCell_ScramblingCode, "Scrambling Code", "UMTSRRInfo: Failed to retrieve Scrambling Code\n"},
};
// clang-format on
static_assert(rowsFit(kLayouts));

constexpr std::size_t kTransmitPowerLength = 16;
constexpr Field kEntryCount = u8(14);
constexpr Elements kEntries{16, 14};
constexpr Field kAgc = u16(4); // signed, 0.1 dB above -70 dBm, less 512; 0 means no value

} // namespace

std::string_view UMTSRRInfo::getSectionName() const
{
    return "UMTS RR Info";
}

std::vector<LogCode> UMTSRRInfo::getLogCodeArray() const
{
    return {kRrcState, kTransmitPower, kServingCell, kCiphering, kCellMonitor};
}

void UMTSRRInfo::updateWithData(Record data, LogCode logCode)
{
    logEntry();
    if (logCode == kCellMonitor)
        showServingCell(data, {kVoxCellTechnology_UMTS}, kCell, sectionRef.dictionary(), roles);
    else if (logCode == kTransmitPower)
        showTransmitPower(data);
    else if (!publish(data, logCode, kLayouts))
        reportUnknown(logCode);
    else if (logCode == kServingCell && data.size() >= kServingCellLength)
        forgetMonitoredFrequency();
}

void UMTSRRInfo::showTransmitPower(Record data) const
{
    if (!holds(data, kTransmitPowerLength))
        return;
    double sum = 0.0;
    int values = 0;
    const std::size_t count = data.read(kEntryCount).value_or(0);
    for (std::size_t i = 0; i < count; ++i) {
        const auto entry = elementOf(data, kEntries, i);
        if (!entry)
            break;
        const auto agc = static_cast<std::int16_t>(entry->read(kAgc).value_or(0));
        if (agc == 0)
            continue;
        const int power = (agc + 512) / 10 - 70; // in whole dB, truncated toward zero
        sum += power;
        ++values;
    }
    publish("Transmit Power", formatted("%4.2lf dBm", sum / values)); // not a number without any value
}

void UMTSRRInfo::forgetMonitoredFrequency() const
{
    // The modem's own downlink frequency replaces it until the cell monitor speaks again.
    if (auto* node = sectionRef.dictionary())
        node->remove("UARFCN");
}

} // namespace kestrum
