#pragma once

#include "voxd/scenarios/Coverage.h"
#include "voxd/scenarios/World.h"

#include <cstddef>
#include <span>

namespace kestrum {

// The identities of the sites' cells. All modems share them, so that one modem's neighbour is another modem's serving
// cell.

/// GERAN (3GPP TS 45.005, 23.003).
struct GsmCell {
    int arfcn, bsic, identity, locationArea, routingArea;
};
GsmCell gsmCell(const World& world, std::size_t site);

/// UTRA FDD (3GPP TS 25.101, 25.331). The identity is RNC (12 bits) and cell (16 bits).
struct UmtsCell {
    int uarfcn, uplinkUarfcn, scramblingCode, identity, locationArea, routingArea, registrationArea;
};
UmtsCell umtsCell(const World& world, std::size_t site);

/// UTRA TDD, 1.28 Mcps (3GPP TS 25.102): one frequency for both directions; the cell parameter identity is 0 to 127.
struct TddCell {
    int uarfcn, parameter, identity, locationArea, registrationArea;
};
TddCell tddCell(const World& world, std::size_t site);

/// A carrier of E-UTRA (3GPP TS 36.101, 36.304).
struct LteLayer {
    Carrier carrier;
    int band, earfcn, uplinkEarfcn, resourceBlocks, priority;
};
std::span<const LteLayer> lteLayers();

/// E-UTRA. The identity is eNB (20 bits) and cell (8 bits).
struct LteCell {
    int physicalId, identity, trackingArea;
};
LteCell lteCell(const World& world, std::size_t layer, std::size_t site);

/// CDMA2000 (3GPP2 C.S0005): the pilot's offset in units of 64 chips; the network's systems and networks.
struct CdmaCell {
    int pilot, system, network, packetZone, baseStation;
};
CdmaCell cdmaCell(const World& world, std::size_t site);

} // namespace kestrum
