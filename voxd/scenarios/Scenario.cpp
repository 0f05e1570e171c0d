#include "voxd/scenarios/Scenario.h"

#include "platform/TelephonyService.h"
#include "voxd/scenarios/CdmaModem.h"
#include "voxd/scenarios/Drive.h"
#include "voxd/scenarios/GsmModem.h"
#include "voxd/scenarios/IfxScenario.h"
#include "voxd/scenarios/LteModem.h"
#include "voxd/scenarios/UtranModem.h"

#include <algorithm>

namespace kestrum {
namespace {

template <Drive::MakeModem... modems>
std::unique_ptr<ScenarioSource> drive(const ScenarioSetting& setting)
{
    return std::make_unique<Drive>(setting, std::initializer_list<Drive::MakeModem>{modems...});
}

constexpr Scenario kScenarios[] = {
    {"lte", kVoxLogChannelTechnology_Zephra_LTE, "LTE: reselection, measurements, handovers", drive<makeLteModem>},
    {"gsm", kVoxLogChannelTechnology_Zephra_GSM, "GSM and UMTS: reselection, calls, data", drive<makeGsmModem>},
    {"cdma", kVoxLogChannelTechnology_Zephra_CDMA, "CDMA2000: calls over 1x, data over EV-DO", drive<makeCdmaModem>},
    {"utran", kVoxLogChannelTechnology_Zephra_UTRAN2, "UTRA TDD: reselection, data", drive<makeUtranModem>},
    {"drive", kVoxLogChannelTechnology_Zephra_LTE, "half a minute of LTE, half a minute of GSM/UMTS, and so on",
     drive<makeLteModem, makeGsmModem>},
    {"ifx", kVoxLogChannelTechnology_IFX, "trees of an IFX modem: GSM cells, calls, packet data", makeIfxScenario},
};

} // namespace

std::span<const Scenario> scenarios()
{
    return kScenarios;
}

std::unique_ptr<ScenarioSource> makeScenario(std::string_view name, const ScenarioSetting& setting)
{
    const auto found = std::ranges::find(kScenarios, name, &Scenario::name);
    return found == std::end(kScenarios) ? nullptr : found->make(setting);
}

} // namespace kestrum
