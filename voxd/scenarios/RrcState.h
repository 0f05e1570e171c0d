#pragma once

#include "voxd/scenarios/Traffic.h"
#include "voxd/scenarios/World.h"

namespace kestrum {

/// UTRA's radio resource control (3GPP TS 25.331), numbered as in the logs of both modems that have it.
enum class RrcState { Disconnected, Connecting, Fach, Dch, CellPch, UraPch };

/// Little data uses the common channel, much data a dedicated one. Afterwards the phone is reachable by paging for a
/// while: in the registration area when the car is fast, else in the cell.
inline RrcState rrcState(const Traffic& traffic, const World& world)
{
    constexpr double kLittle = 0.25, kFast = 22; // share of the link; m/s
    switch (traffic.phase()) {
    case Traffic::Phase::Setup:
        return RrcState::Connecting;
    case Traffic::Phase::Active:
        return traffic.isData() && traffic.load() < kLittle ? RrcState::Fach : RrcState::Dch;
    case Traffic::Phase::Release:
        if (traffic.isVoice())
            return RrcState::Fach;
        return world.speed() > kFast ? RrcState::UraPch : RrcState::CellPch;
    case Traffic::Phase::Idle:
        break;
    }
    return RrcState::Disconnected;
}

} // namespace kestrum
