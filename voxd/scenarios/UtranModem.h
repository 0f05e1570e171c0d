#pragma once

#include "voxd/scenarios/Modem.h"
#include "voxd/scenarios/Random.h"

#include <memory>

namespace kestrum {

class World;

/// A UTRA TDD modem: camps, transfers data, measures neighbours of its own technology and of GSM. The world must
/// outlive it.
std::unique_ptr<Modem> makeUtranModem(const World& world, Random random);

} // namespace kestrum
