#pragma once

#include "voxd/scenarios/Modem.h"
#include "voxd/scenarios/Random.h"

#include <memory>

namespace kestrum {

class World;

/// An E-UTRA modem on two carriers: reselects in idle mode, measures and is handed over in connected mode.
/// The world outlives it.
std::unique_ptr<Modem> makeLteModem(const World& world, Random random);

} // namespace kestrum
