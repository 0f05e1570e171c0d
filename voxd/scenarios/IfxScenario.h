#pragma once

#include "voxd/scenarios/Scenario.h"

#include <memory>

namespace kestrum {

/// An IFX modem on a drive. Every half second it logs the whole tree of its measurements as an XML property list.
std::unique_ptr<ScenarioSource> makeIfxScenario(const ScenarioSetting& setting);

} // namespace kestrum
