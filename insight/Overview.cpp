#include "insight/Overview.h"

#include "platform/TelephonyService.h"

#include <span>
#include <utility>

namespace kestrum {
namespace {

constexpr std::size_t kBest = 5, kBestOfOthers = 3; // neighbours, of the first list and of further ones
constexpr std::size_t kColumns = 5;

struct Group {
    std::string_view caption;
    std::span<const KeyPlace> keys; ///< identity first, then levels, which have lines of their own
};

/// What an overview shows, in order. What the display does not hold is left out.
struct Plan {
    std::string_view technology;
    std::span<const Group> groups;
    std::span<const std::string_view> lists;
};

// clang-format off
constexpr std::string_view kConnectedMode = "Connected mode LTE Intra-frequency Measurement";
constexpr KeyPlace kLteCell[] = {
    {"Serving Cell Measurements", "Physical Cell ID"}, {"Serving Cell Measurements", "E-ARFCN"},
    {"Serving Cell Info", "Freq Band Indicator"}, {"Serving Cell Info", "Download Bandwidth"},
    {"Serving Cell Info", "Tracking Area Code"}, {"Serving Cell Info", "Cell Identity"},
    {"Serving Cell Measurements", "Measured RSRP"}, {"Serving Cell Measurements", "Measured RSRQ"},
    {"Serving Cell Measurements", "Measured RSSI"}, {"Serving Cell Measurements", "Srxlev"},
};
constexpr KeyPlace kLteConnected[] = {
    {kConnectedMode, "Serving Physical Cell ID"}, {kConnectedMode, "E-ARFCN"},
    {kConnectedMode, "Serving Filtered RSRP"}, {kConnectedMode, "Serving Filtered RSRQ"},
};
constexpr Group kLte[] = {{"Serving cell", kLteCell}, {"Connected", kLteConnected}};
constexpr std::string_view kLteLists[] = {"Measured Neighbor Cells", "Neighbor Cells List", "Reselection Candidates List"};

constexpr KeyPlace kNetwork[] = {
    {"Serving PLMN", "Mobile Country Code"}, {"Serving PLMN", "Mobile Network Code"},
    {"Serving PLMN", "Location Area Code"}, {"Serving PLMN", "Routing Area Code"}, {"Serving PLMN", "Service Type"},
};
constexpr KeyPlace kGsmCell[] = {
    {"GSM Serving Cell", "ARFCN"}, {"GSM Serving Cell", "BSIC"}, {"GSM Serving Cell", "Cell ID"},
    {"GSM Serving Cell", "C1 Value"}, {"GSM Serving Cell", "C2 Value"}, {"GSM RR Info", "RR State"},
    {"GSM RR Info", "Serving Rx Level"},
};
constexpr KeyPlace kUmtsCell[] = {
    {"UMTS RR Info", "Scrambling Code"}, {"UMTS RR Info", "UARFCN"}, {"UMTS RR Info", "Cell ID"},
    {"UMTS RR Info", "RRC State"}, {"UMTS RR Info", "Transmit Power"},
};
constexpr KeyPlace kRegistration[] = {
    {"Process CS", "MM State"}, {"Process CS", "MM Sub State"}, {"Process PS", "MM State"},
    {"Process PS", "MM Sub State"},
};
constexpr Group kGsm[] = {{"Network", kNetwork}, {"GSM cell", kGsmCell}, {"UMTS cell", kUmtsCell},
                          {"Registration", kRegistration}};
constexpr std::string_view kGsmLists[] = {"Neighboring Cells", "Active Set", "UMTS Set", "GSM Set"};

constexpr KeyPlace kUtranCell[] = {
    {"Serving Cell Info", "Cell Scrambling Code"}, {"Serving Cell Info", "Downlink UARFCN"},
    {"Serving Cell Info", "Freq Band Indicator"}, {"Serving Cell Info", "Local Area Code"},
    {"Serving Cell Info", "URA ID"}, {"Serving Cell Info", "Cell ID"},
};
constexpr KeyPlace kUtranState[] = {{"RRC Info", "State"}, {"Serving Cell Info", "Allowed Access"}};
constexpr Group kUtran[] = {{"Serving cell", kUtranCell}, {"State", kUtranState}};
constexpr std::string_view kUtranLists[] = {"Neighbor Cell List"};

constexpr KeyPlace kSystem[] = {
    {"System", "System ID"}, {"System", "Network ID"}, {"System", "Base Station ID"}, {"System", "Roaming"},
};
constexpr KeyPlace kEvdo[] = {
    {"EV-DO/Radio", "Serving PN Offset"}, {"EV-DO/Radio", "Channel"}, {"EV-DO/Radio", "Band Class"},
    {"EV-DO/State", "Device State"}, {"EV-DO/State", "Session State"},
    {"EV-DO/Radio", "Rx0 AGC"}, {"EV-DO/Radio", "Tx AGC"}, {"EV-DO", "Forward Link Rate"}, {"EV-DO", "Reverse Link Rate"},
};
constexpr KeyPlace kOneX[] = {
    {"1x/Radio", "Rx0 Channel"}, {"1x/Radio", "Rx0 Band Class"}, {"1x", "Device State"},
    {"1x/Radio", "Rx0 AGC"}, {"1x/Radio", "Tx AGC"}, {"1x", "Traffic FER"},
};
constexpr Group kCdma[] = {{"System", kSystem}, {"EV-DO", kEvdo}, {"1x", kOneX}};
constexpr std::string_view kCdmaLists[] = {"EV-DO/Active Set Pilots", "1x/Active Set"};

constexpr KeyPlace kIfxCell[] = {
    {"Serving Cell", "ARFCN"}, {"Serving Cell", "BSIC"}, {"Serving Cell", "MCC"}, {"Serving Cell", "MNC"},
    {"Serving Cell", "LAC"}, {"Serving Cell", "Cell ID"},
    // A modem that speaks several technologies has the keys of each of them.
    {"Serving Cell", "Technology"}, {"Serving Cell", "Physical Cell ID"}, {"Serving Cell", "E-ARFCN"},
    {"Serving Cell", "NR-ARFCN"}, {"Serving Cell", "UARFCN"}, {"Serving Cell", "Scrambling Code"},
    {"Serving Cell", "Tracking Area Code"}, {"Serving Cell", "Location Area Code"}, {"Serving Cell", "Cell Identity"},
    {"Serving Cell", "Measured RSRP"}, {"Serving Cell", "Measured RSRQ"}, {"Serving Cell", "RSCP"},
    {"Serving Cell", "Energy Per Chip"}, {"Serving Cell", "RSSI"}, {"Serving Cell", "Measured RSSI"},
    {"Serving Cell", "SNR"}, {"Serving Cell", "SINR"}, {"Serving Cell", "C1"}, {"Serving Cell", "C2"},
};
constexpr KeyPlace kIfxState[] = {
    {"Radio Resource/Status", "State"}, {"Radio Resource/Status", "Channel"}, {"Radio Resource", "Band"},
    {"Mobility Management", "MM State"}, {"Mobility Management", "GMM State"},
    {"Radio Resource/Status", "RxQual"},
};
constexpr Group kIfx[] = {{"Serving cell", kIfxCell}, {"State", kIfxState}};
constexpr std::string_view kIfxLists[] = {"Neighbor Cells"};

constexpr Plan kPlans[] = {
    {kVoxLogChannelTechnology_Zephra_LTE, kLte, kLteLists},
    {kVoxLogChannelTechnology_Zephra_GSM, kGsm, kGsmLists},
    {kVoxLogChannelTechnology_Zephra_UTRAN2, kUtran, kUtranLists},
    {kVoxLogChannelTechnology_Zephra_CDMA, kCdma, kCdmaLists},
    {kVoxLogChannelTechnology_IFX, kIfx, kIfxLists},
};
// clang-format on

/// Whether the value deserves a line with a bar.
bool hasBar(const KeyEntry& entry)
{
    return entry.kind == Kind::Level || entry.in.measure != Measure::None;
}

const Plan* planOf(std::string_view technology)
{
    for (const auto& plan : kPlans)
        if (plan.technology == technology)
            return &plan;
    return nullptr;
}

} // namespace

std::vector<SheetPart> Overview::update(const KestrumModelNode& root)
{
    std::vector<SheetPart> parts;
    const auto* plan = planOf(_technology);
    if (plan == nullptr)
        return parts;
    const auto sections = sectionNodes(_technology, root);
    for (const auto& group : plan->groups) {
        SheetPart part{.caption = std::string(group.caption)};
        for (const auto& [name, key] : group.keys) {
            const auto* section = findSection(sections, name);
            const auto* text = section != nullptr ? leafText(*section->node, key) : nullptr;
            if (text == nullptr || text->empty())
                continue;
            const auto* entry = keyEntry(_technology, name, key);
            auto cell = gradedCell(entry, *text, *_thresholds, leafText(*section->node, kTechnologyKey));
            if (entry == nullptr || !hasBar(*entry))
                cell.bar.reset();
            part.facts.push_back({std::string(entry != nullptr ? entry->heading : key), std::move(cell)});
        }
        if (!part.facts.empty())
            parts.push_back(std::move(part));
    }
    auto most = kBest;
    for (const auto& name : plan->lists) {
        const auto* section = findSection(sections, name);
        if (section == nullptr || section->node->childNodes()->empty())
            continue;
        auto& list = _lists.try_emplace(section->path, _technology, section->path, *_thresholds).first->second;
        if (!list.update(root))
            continue;
        auto part = list.part(std::exchange(most, kBestOfOthers), kColumns);
        part.caption = list.title();
        parts.push_back(std::move(part));
    }
    return parts;
}

} // namespace kestrum
