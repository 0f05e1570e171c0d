#pragma once

#include "voxd/Source.h"

#include <memory>

namespace kestrum {

struct ScenarioSetting;

/// An IFX modem on a drive. Every half second it logs the whole tree of its measurements as an XML property list.
std::unique_ptr<Source> makeIfxScenario(const ScenarioSetting& setting);

} // namespace kestrum
