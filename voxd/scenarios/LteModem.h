#pragma once

#include "voxd/scenarios/Modem.h"
#include "voxd/scenarios/Random.h"

#include <memory>

namespace kestrum {

class World;

/// An E-UTRA modem on two carriers. It reselects in idle mode, and measures and hands over in connected mode. The
/// world must outlive it.
std::unique_ptr<Modem> makeLteModem(const World& world, Random random);

} // namespace kestrum
