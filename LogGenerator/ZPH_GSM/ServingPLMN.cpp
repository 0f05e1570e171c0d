#include "LogGenerator/ZPH_GSM/ServingPLMN.h"

#include "LogGenerator/CellMonitor.h"
#include "LogGenerator/ZPH_GSM/NasStates.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

constexpr LogCode kServingPlmn = 0x7135, kCellMonitor = 0xFF0001;

std::string_view selectionMode(std::uint32_t raw)
{
    static constexpr std::string_view kNames[] = {
        "Automatic", "Manual", "Limited", "LIMITED_ROUTINE_ACQ", "LIMITED_MANUAL_ACQ",
    };
    return nameIn(kNames, raw);
}

std::string_view serviceType(std::uint32_t raw)
{
    static constexpr std::string_view kNames[] = {
        "NO_SERVICE", "CS_ONLY", "PS_ONLY", "CS_PS_SERVICE", "LIMITED_SERVICE",
    };
    return nameIn(kNames, raw);
}

/// The digit in a half byte; a blank where there is none.
char digit(std::uint32_t identity, unsigned halfByte)
{
    const std::uint32_t value = (identity >> (4 * halfByte)) & 0xF;
    return value < 10 ? static_cast<char>('0' + value) : ' ';
}

// The network's identity, three bytes of digits (3GPP TS 24.008, 10.5.1.3). From the first half byte: MCC 1, MCC 2,
// MCC 3, MNC 3, MNC 1, MNC 2.
constexpr Field kIdentity = u32(15).bits(0, 23);

std::string countryCode(std::uint32_t identity)
{
    return formatted("%c%c%c", digit(identity, 0), digit(identity, 1), digit(identity, 2));
}

std::string networkCode(std::uint32_t identity)
{
    return formatted("%c%c%c", digit(identity, 4), digit(identity, 5), digit(identity, 3));
}

// clang-format off
constexpr Row kSelection[] = {
    {u8(14),           "PLMN Sel Mod",        selectionMode},
};
constexpr Row kNetwork[] = {
    {kIdentity,        "Mobile Country Code", countryCode},
    {kIdentity,        "Mobile Network Code", networkCode},
    {u16BigEndian(18), "Location Area Code",  decimal}, // as it is on the air, unlike all else
    {u8(20),           "Routing Area Code",   decimal},
    {u8(14),           "Service Type",        serviceType},
};
constexpr Layout kLayouts[] = {
    {kServingPlmn,       32,                  kNetwork},
    {nas::kRegistration, nas::kMinimumLength, kSelection},
};

constexpr CellRow kCell[] = {
    {kVoxCell_MCC, "Mobile Country Code", "ServingPLMN: Failed to retrieve MCC\n"},
    {kVoxCell_MNC, "Mobile Network Code", "ServingPLMN: Failed to retrieve MNC\n"},
    {kVoxCell_LAC, "Location Area Code",  "ServingPLMN: Failed to retrieve LAC\n"},
};
// clang-format on
static_assert(rowsFit(kLayouts));

} // namespace

std::string_view ServingPLMN::getSectionName() const
{
    return "Serving PLMN";
}

std::vector<LogCode> ServingPLMN::getLogCodeArray() const
{
    return codesOf(kLayouts, {kCellMonitor});
}

void ServingPLMN::updateWithData(Record data, LogCode logCode)
{
    logEntry();
    if (logCode == kCellMonitor)
        showServingCell(data, {kVoxCellTechnology_GSM, kVoxCellTechnology_UMTS}, kCell, sectionRef.dictionary(), roles);
    else if (!publish(data, logCode, kLayouts))
        reportUnknown(logCode);
}

} // namespace kestrum
