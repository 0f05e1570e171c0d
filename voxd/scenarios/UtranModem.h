#pragma once

#include "voxd/scenarios/Modem.h"
#include "voxd/scenarios/Random.h"

#include <memory>

namespace kestrum {

class World;

/// A UTRA TDD modem: camps, transfers data, watches its own and GSM's neighbours. The world outlives it.
std::unique_ptr<Modem> makeUtranModem(const World& world, Random random);

} // namespace kestrum
