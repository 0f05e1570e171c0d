#include "LogGenerator/ZPH_GSM/UMTSRRInfo.h"

#include "LogGenerator/CellMonitor.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

constexpr LogCode kRrcState = 0x4125, kTransmitPower = 0x4031, kServingCell = 0x4127, kCiphering = 0x4157;

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
    {u8(13),  "RRC State",          named<rrcState>},
};
constexpr Row kIdentity[] = {
    {u32(21), "Cell ID",            decimalSigned32},
    {u32(17), "Downlink Frequency", decimalSigned32},
    {u32(13), "Uplink Frequency",   decimalSigned32},
    {u16(25), "URA ID",             decimalSigned32},
};
constexpr Row kSecurity[] = {
    {u8(13),  "Ciphering",          named<enabled>},
};

constexpr CellRow kCell[] = {
    {kVoxCell_CellId,         "Cell ID",         "UMTSRRInfo: Failed to retrieve Cell ID\n"},
    {kVoxCell_UARFCN,         "UARFCN",          "UMTSRRInfo: Failed to retrieve UARFCN\n"},
    {kVoxCell_ScramblingCode, "Scrambling Code", "UMTSRRInfo: Failed to retrieve Scrambling Code\n"},
};
// clang-format on
std::string decibelMilliwatts(double level)
{
    return formatted("%4.2lf dBm", level);
}
constexpr Quantity kMeanPower = computedQuantity<decibelMilliwatts>("dBm");

constexpr Field kEntryCount = u8(14);
constexpr Elements kEntries{16, 14};
constexpr Field kAgc = u16(4); // signed; plus 512 it is the level above -70 dBm in 0.1 dB; 0 means no value

constexpr Layout kLayouts[] = {
    {.code = kRrcState, .minimumLength = 14, .rows = kState},
    {.code = kTransmitPower, .minimumLength = 16},
    {.code = kServingCell, .minimumLength = 29, .rows = kIdentity},
    {.code = kCiphering, .minimumLength = 19, .rows = kSecurity},
    {.code = kCellMonitorRecord},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "UMTS RR Info",
    .layouts = kLayouts,
    .entryLine = "UMTSRRInfo",
};

} // namespace

UMTSRRInfo::UMTSRRInfo(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void UMTSRRInfo::decode(Record data, const Layout& layout)
{
    if (layout.code == kCellMonitorRecord)
        return showServingCell(data, {kVoxCellTechnology_UMTS}, kCell, sectionRef.dictionary(), roles);
    if (layout.code == kTransmitPower)
        return showTransmitPower(data);
    publish(data, layout.rows);
    if (layout.code == kServingCell)
        forgetMonitoredFrequency();
}

void UMTSRRInfo::showTransmitPower(Record data) const
{
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
    publish("Transmit Power", Reading::computed(kMeanPower, sum / values)); // NaN without a value
}

void UMTSRRInfo::forgetMonitoredFrequency() const
{
    // The modem's downlink frequency replaces it until the next cell-monitor record.
    if (auto* node = sectionRef.dictionary())
        node->remove("UARFCN");
}

} // namespace kestrum
