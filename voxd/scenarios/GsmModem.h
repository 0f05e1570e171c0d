#pragma once

#include "voxd/scenarios/Modem.h"
#include "voxd/scenarios/Random.h"

#include <memory>

namespace kestrum {

class World;

/// A GSM/UMTS modem: camps on UMTS where possible, else on GSM; makes calls, transfers data, updates its location.
/// The world must outlive it.
std::unique_ptr<Modem> makeGsmModem(const World& world, Random random);

} // namespace kestrum
