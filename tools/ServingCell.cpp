#include "tools/ServingCell.h"

#include "platform/TelephonyService.h"

#include <algorithm>
#include <array>

namespace kestrum::tools {
namespace {

/// Values of one node of a technology's display.
struct Place {
    std::string_view technology;
    std::string_view node;                ///< the end of its path
    std::string_view prefix;              ///< of the names: nodes may have keys in common
    std::array<std::string_view, 6> keys; ///< the rest is empty
};

constexpr Place kPlaces[] = {
    {kVoxLogChannelTechnology_Zephra_LTE,
     "/Serving Cell Info",
     "",
     {"Physical Cell ID", "Cell Identity", "Tracking Area Code", "Freq Band Indicator", "Download Frequency"}},
    {kVoxLogChannelTechnology_Zephra_LTE,
     "/Serving Cell Measurements",
     "",
     {"E-ARFCN", "Measured RSRP", "Average RSRP", "Measured RSRQ", "Average RSRQ", "Measured RSSI"}},
    {kVoxLogChannelTechnology_Zephra_LTE,
     "/Connected mode LTE Intra-frequency Measurement",
     "",
     {"Serving Physical Cell ID", "Serving Filtered RSRP", "Serving Filtered RSRQ"}},
    {kVoxLogChannelTechnology_Zephra_GSM,
     "/Serving PLMN",
     "",
     {"Mobile Country Code", "Mobile Network Code", "Location Area Code", "Routing Area Code"}},
    {kVoxLogChannelTechnology_Zephra_GSM, "/GSM Serving Cell", "GSM ", {"Cell ID", "ARFCN", "BSIC", "RSSI"}},
    {kVoxLogChannelTechnology_Zephra_GSM, "/UMTS RR Info", "UMTS ", {"Cell ID", "UARFCN", "Scrambling Code"}},
    {kVoxLogChannelTechnology_Zephra_GSM, "/Active Set/0", "UMTS ", {"RSCP", "Energy Per Chip"}},
    {kVoxLogChannelTechnology_Zephra_CDMA, "/System", "", {"System ID", "Network ID", "Base Station ID"}},
    {kVoxLogChannelTechnology_Zephra_CDMA, "/1x/Radio", "1x ", {"Rx0 Band Class", "Rx0 Channel", "Rx0 AGC", "Rx1 AGC"}},
    {kVoxLogChannelTechnology_Zephra_CDMA,
     "/EV-DO/Radio",
     "EV-DO ",
     {"Band Class", "Channel", "Serving PN Offset", "Rx0 AGC", "Rx1 AGC"}},
    {kVoxLogChannelTechnology_Zephra_UTRAN2,
     "/Serving Cell Info",
     "",
     {"Cell ID", "Local Area Code", "URA ID", "Freq Band Indicator", "Downlink UARFCN", "Cell Scrambling Code"}},
};

/// The path without the "n;" before names, which only give their order.
std::string withoutNumbers(std::string_view path)
{
    std::string names;
    while (!path.empty()) {
        auto step = path.substr(1, path.find('/', 1) - 1);
        path.remove_prefix(1 + step.size());
        const auto behind = step.find_first_not_of("0123456789");
        if (behind != 0 && behind != step.npos && step[behind] == ';')
            step.remove_prefix(behind + 1);
        names.append("/").append(step);
    }
    return names;
}

/// A JSON Pointer's text without its escapes.
std::string unescaped(std::string_view text)
{
    std::string plain;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const bool isEscape = text[i] == '~' && i + 1 < text.size();
        plain += !isEscape ? text[i] : text[++i] == '1' ? '/' : '~';
    }
    return plain;
}

/// The trees of IFX modems differ. All that is below "Serving Cell" counts; a node around it may name the modem.
std::optional<std::string> nameInTree(std::string_view names)
{
    constexpr std::string_view kNode = "/Serving Cell/";
    const auto at = names.find(kNode);
    if (at == names.npos)
        return std::nullopt;
    const auto around = names.substr(0, at), value = names.substr(at + kNode.size());
    return around.empty() ? unescaped(value) : unescaped(around.substr(1)).append("/").append(unescaped(value));
}

} // namespace

std::optional<std::string> servingCellName(std::string_view technology, std::string_view path)
{
    const auto names = withoutNumbers(path);
    if (technology == kVoxLogChannelTechnology_IFX)
        return nameInTree(names);
    const auto slash = names.rfind('/');
    if (slash == names.npos || slash + 1 == names.size())
        return std::nullopt;
    const auto key = std::string_view(names).substr(slash + 1), node = std::string_view(names).substr(0, slash);
    for (const auto& place : kPlaces)
        if (place.technology == technology && node.ends_with(place.node) &&
            std::ranges::find(place.keys, key) != place.keys.end())
            return std::string(place.prefix).append(key);
    return std::nullopt;
}

} // namespace kestrum::tools
