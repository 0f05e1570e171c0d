#pragma once

#include "voxd/Source.h"

#include <memory>

namespace kestrum {

struct ScenarioSetting;

/// An IFX modem on a drive: every half second the whole tree of what it measures, as an XML property list.
std::unique_ptr<Source> makeIfxScenario(const ScenarioSetting& setting);

} // namespace kestrum
