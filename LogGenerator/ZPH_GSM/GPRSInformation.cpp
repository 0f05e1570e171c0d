#include "LogGenerator/ZPH_GSM/GPRSInformation.h"

namespace kestrum {
namespace {

constexpr std::uint32_t kNotSent = 255;

std::string_view si13Position(std::uint32_t raw)
{
    static constexpr std::string_view kNames[] = {"Located on BCCH", "Located on Extended BCCH"};
    return raw == kNotSent ? "Not Available" : nameIn(kNames, raw);
}

std::string_view networkControlOrder(std::uint32_t raw)
{
    static constexpr std::string_view kNames[] = {"NC0", "NC1", "NC2"};
    return raw == kNotSent ? "Not Available" : nameIn(kNames, raw);
}

std::string_view packetFlowContext(std::uint32_t raw)
{
    static constexpr std::string_view kNames[] = {"Not Supported", "Supported"};
    return raw == kNotSent ? "Available" : nameIn(kNames, raw); // kept: not "Not Available"
}

std::string_view accessThreshold(std::uint32_t raw)
{
    static constexpr std::string_view kNames[] = {
        "Barred (PKT access not allowed in the Cell)",
        "Barred",
        "Barred",
        "1 Only",
        "1 to 2",
        "1 to 3",
        "1 to 4",
        "Allowed",
    };
    return raw == kNotSent ? "Not Available" : nameIn(kNames, raw);
}

/// The timer T3192 (3GPP TS 44.060) in milliseconds.
constexpr int kT3192Values[] = {500, 1000, 1500, 0, 80, 120, 160, 200};
constexpr Quantity kT3192{
    [](Quantity::Raw raw) { return raw < std::size(kT3192Values) ? formatted("%d ms", kT3192Values[raw]) : "?? ms"; },
    [](Quantity::Raw raw) { return raw < std::size(kT3192Values) ? kT3192Values[raw] : kNotANumber; }, "ms"};

std::string_view accessBurst(std::uint32_t raw)
{
    return raw != 0 ? "11-bit format" : "8-bit format";
}

std::string_view supported(std::uint32_t raw)
{
    return raw != 0 ? "Supported" : "Not Supported";
}

std::string_view applied(std::uint32_t raw)
{
    return raw != 0 ? "Applied" : "Not Applied";
}

std::string_view operatingMode(std::uint32_t raw)
{
    static constexpr std::string_view kNames[] = {"Class 1", "Class 2", "Class 3"};
    return nameIn(kNames, raw);
}

// clang-format off
constexpr Row kSi13[] = {
    {u8(14), "SI13 Position",             named<si13Position>},
};
constexpr Row kControl[] = {
    {u8(15), "Network Control Order",     named<networkControlOrder>},
    {u8(13), "PFC Supported",             named<packetFlowContext>},
    {u8(14), "Priority Access Threshold", named<accessThreshold>},
};
constexpr Row kTimers[] = {
    {u8(15), "T3192",                     kT3192},
    {u8(17), "Access Burst Type",         named<accessBurst>},
    {u8(16), "DRX Timer Max",             decimalSigned32},
};
constexpr Row kPbcch[] = {
    {u8(13), "PBCCH Present",             decimalSigned32},
};
constexpr Row kPacketStatus[] = {
    {u8(16), "Ext Measurement Order",     decimalSigned32},
    {u8(13), "Packet PSI Status",         decimalSigned32},
    {u8(33), "Packet SI Status",          named<supported>},
    {u8(14), "Count LR",                  decimalSigned32},
    {u8(15), "Count HR",                  decimalSigned32},
};
constexpr Row kServingPlmn[] = {
    {u8(13), "Network Operating Mode",    named<operatingMode>},
};
constexpr Row kMeasurements[] = {
    {u8(26), "Cell Reselect Hysteresis",  named<applied>},
};

// clang-format on

constexpr Layout kLayouts[] = {
    {.code = 0x51F5, .minimumLength = 18, .rows = kControl},
    {.code = 0x7135, .minimumLength = 32, .rows = kServingPlmn},
    {.code = 0x51F6, .minimumLength = 24, .rows = kTimers},
    {.code = 0x51FB, .minimumLength = 34, .rows = kPbcch},
    {.code = 0x51FD, .minimumLength = 35, .rows = kPacketStatus},
    {.code = 0x51F4, .minimumLength = 15, .rows = kSi13},
    {.code = 0x5137, .minimumLength = 29, .rows = kMeasurements},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "GPRS Information",
    .layouts = kLayouts,
    .entryLine = "GPRSInformation",
};

} // namespace

GPRSInformation::GPRSInformation(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

} // namespace kestrum
