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
    return raw == kNotSent ? "Available" : nameIn(kNames, raw); // not "Not Available", on purpose
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

std::string_view t3192(std::uint32_t raw)
{
    static constexpr std::string_view kNames[] = {
        "500 ms", "1000 ms", "1500 ms", "0 ms", "80 ms", "120 ms", "160 ms", "200 ms",
    };
    return raw < std::size(kNames) ? kNames[raw] : "?? ms";
}

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
    {u8(14), "SI13 Position",             si13Position},
};
constexpr Row kControl[] = {
    {u8(15), "Network Control Order",     networkControlOrder},
    {u8(13), "PFC Supported",             packetFlowContext},
    {u8(14), "Priority Access Threshold", accessThreshold},
};
constexpr Row kTimers[] = {
    {u8(15), "T3192",                     t3192},
    {u8(17), "Access Burst Type",         accessBurst},
    {u8(16), "DRX Timer Max",             decimal},
};
constexpr Row kPbcch[] = {
    {u8(13), "PBCCH Present",             decimal},
};
constexpr Row kPacketStatus[] = {
    {u8(16), "Ext Measurement Order",     decimal},
    {u8(13), "Packet PSI Status",         decimal},
    {u8(33), "Packet SI Status",          supported},
    {u8(14), "Count LR",                  decimal},
    {u8(15), "Count HR",                  decimal},
};
constexpr Row kServingPlmn[] = {
    {u8(13), "Network Operating Mode",    operatingMode},
};
constexpr Row kMeasurements[] = {
    {u8(26), "Cell Reselect Hysteresis",  applied},
};

constexpr Layout kLayouts[] = {
    {0x51F5, 18, kControl},
    {0x7135, 32, kServingPlmn},
    {0x51F6, 24, kTimers},
    {0x51FB, 34, kPbcch},
    {0x51FD, 35, kPacketStatus},
    {0x51F4, 15, kSi13},
    {0x5137, 29, kMeasurements},
};
// clang-format on
static_assert(rowsFit(kLayouts));

} // namespace

std::string_view GPRSInformation::getSectionName() const
{
    return "GPRS Information";
}

std::vector<LogCode> GPRSInformation::getLogCodeArray() const
{
    return codesOf(kLayouts);
}

void GPRSInformation::updateWithData(Record data, LogCode logCode)
{
    logEntry();
    if (!publish(data, logCode, kLayouts))
        reportUnknown(logCode);
}

} // namespace kestrum
