#include "capture/Technology.h"

#include "platform/ChannelMessage.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

/// The record that opens a DLF stream names the program that wrote it; any modem's stream has it.
constexpr LogCode kDlfVersionReport = 0x1FFD;

} // namespace

std::optional<std::string_view> technologyOf(Bytes message)
{
    const auto record = channelRecord(message);
    if (!record)
        return isPropertyList(message) ? std::optional(kVoxLogChannelTechnology_IFX) : std::nullopt;
    if (record->code == kDlfVersionReport)
        return std::nullopt;
    // The first hexadecimal digit is the part of the modem that logs.
    switch (record->code >> 12) {
    case 0x1:
        return kVoxLogChannelTechnology_Zephra_CDMA;
    case 0x4:
    case 0x5:
    case 0x7:
        return kVoxLogChannelTechnology_Zephra_GSM;
    case 0xB:
        return kVoxLogChannelTechnology_Zephra_LTE;
    case 0xD:
        return kVoxLogChannelTechnology_Zephra_UTRAN2;
    default:
        return std::nullopt;
    }
}

} // namespace kestrum
