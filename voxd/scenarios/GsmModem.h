#pragma once

#include "voxd/scenarios/Modem.h"
#include "voxd/scenarios/Random.h"

#include <memory>

namespace kestrum {

class World;

/// A GSM/UMTS modem: camps on UMTS where it can, on GSM where it must; calls, data, location updates.
/// The world outlives it.
std::unique_ptr<Modem> makeGsmModem(const World& world, Random random);

} // namespace kestrum
