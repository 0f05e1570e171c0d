#pragma once

#include "voxd/scenarios/Modem.h"
#include "voxd/scenarios/Random.h"

#include <memory>

namespace kestrum {

class World;

/// A CDMA2000 modem: calls over 1x, data over EV-DO, handoffs in both. The world outlives it.
std::unique_ptr<Modem> makeCdmaModem(const World& world, Random random);

} // namespace kestrum
