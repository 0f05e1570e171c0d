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

/// A mast with one cell of each technology.
struct Site {
    Place place;
    bool abroad; ///< across the border, in another network
    int area;    ///< of its network: 0 or 1; location, routing and tracking areas depend on it
    bool town;   ///< a site in a town has all technologies, a site in the country no UMTS
};

/// A small country on both sides of a border: two networks with a few dozen sites, and a car on a ring road that
/// crosses the border twice per round. All technologies share this world.
class World {
public:
    /// The sites' positions vary a little with the seed.
    explicit World(Random random);

    /// Moves the car by `seconds`.
    void drive(double seconds);

    Place car() const { return _car; }
    double speed() const { return _speed; } ///< m/s
    /// Metres driven since the start.
    double way() const { return _way; }

    const std::vector<Site>& sites() const { return _sites; }
    const Plmn& plmn(std::size_t site) const;

    /// The home network of the phone.
    static const Plmn kHome;
    static const Plmn kAbroad;

private:
    Random _random;
    std::vector<Site> _sites;
    Place _car{};
    double _angle; // position on the ring road, radians
    double _speed = 22;
    double _way = 0;
};

} // namespace kestrum
