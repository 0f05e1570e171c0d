#include "LogGenerator/ZPH_GSM/ServingPLMN.h"

#include "LogGenerator/CellMonitor.h"
#include "LogGenerator/ZPH_GSM/NasStates.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

constexpr LogCode kServingPlmn = 0x7135;

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

/// The digit in a half byte; a blank for 10 to 15.
char digit(std::uint32_t identity, unsigned halfByte)
{
    const std::uint32_t value = (identity >> (4 * halfByte)) & 0xF;
    return value < 10 ? static_cast<char>('0' + value) : ' ';
}

// The network's identity: digits in three bytes (3GPP TS 24.008, 10.5.1.3). Order of the half bytes: MCC 1, MCC 2,
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
    {u8(14),           "PLMN Sel Mod",        named<selectionMode>},
};
constexpr Row kNetwork[] = {
    {kIdentity,        "Mobile Country Code", named<countryCode>},
    {kIdentity,        "Mobile Network Code", named<networkCode>},
    {u16BigEndian(18), "Location Area Code",  decimalSigned32}, // as on the air; all other fields are little-endian
    {u8(20),           "Routing Area Code",   decimalSigned32},
    {u8(14),           "Service Type",        named<serviceType>},
};
constexpr CellRow kCell[] = {
    {kVoxCell_MCC, "Mobile Country Code", "ServingPLMN: Failed to retrieve MCC\n"},
    {kVoxCell_MNC, "Mobile Network Code", "ServingPLMN: Failed to retrieve MNC\n"},
    {kVoxCell_LAC, "Location Area Code",  "ServingPLMN: Failed to retrieve LAC\n"},
};
// clang-format on

constexpr Layout kLayouts[] = {
    {.code = kServingPlmn, .minimumLength = 32, .rows = kNetwork},
    {.code = nas::kRegistration, .minimumLength = nas::kMinimumLength, .rows = kSelection},
    {.code = kCellMonitorRecord},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Serving PLMN",
    .layouts = kLayouts,
};

} // namespace

ServingPLMN::ServingPLMN(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void ServingPLMN::decode(Record data, const Layout& layout)
{
    if (layout.code == kCellMonitorRecord)
        showServingCell(data, {kVoxCellTechnology_GSM, kVoxCellTechnology_UMTS}, kCell, sectionRef.dictionary(), roles);
    else
        publish(data, layout.rows);
}

} // namespace kestrum
