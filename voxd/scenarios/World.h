#pragma once

#include "voxd/scenarios/Random.h"

#include <cstddef>
#include <vector>

namespace kestrum {

/// Metres east and north of the map's middle.
struct Place {
    double x, y;
};

double distance(Place one, Place other);

/// A public land mobile network's identity (3GPP TS 23.003).
struct Plmn {
    int mcc, mnc;
    int mncDigits; ///< 2 or 3
};

/// A mast, with a cell of each technology.
struct Site {
    Place place;
    bool abroad; ///< on the other side of the border: another network's
    int area;    ///< of its network: 0 or 1; location, routing and tracking areas follow it
    bool town;   ///< has all technologies; in the country there is no UMTS
};

/// A small country on both sides of a border, two networks with a few dozen sites, and a car on a ring road that
/// crosses the border twice a round. All technologies are received in the same world.
class World {
public:
    /// The sites stand a little elsewhere for each seed.
    explicit World(Random random);

    /// The car goes on for so long.
    void drive(double seconds);

    Place car() const { return _car; }
    double speed() const { return _speed; } ///< m/s
    /// Metres driven since the start.
    double way() const { return _way; }

    const std::vector<Site>& sites() const { return _sites; }
    const Plmn& plmn(std::size_t site) const;

    /// The network of the car's owner.
    static const Plmn kHome;
    static const Plmn kAbroad;

private:
    Random _random;
    std::vector<Site> _sites;
    Place _car{};
    double _angle; // radians on the ring road
    double _speed = 22;
    double _way = 0;
};

} // namespace kestrum
