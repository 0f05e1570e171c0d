#include "voxd/scenarios/World.h"

#include <algorithm>
#include <cmath>

namespace kestrum {
namespace {

constexpr double kEast = 1700, kNorth = 1100;    // half axes of the ring road, metres
constexpr int kColumns = 8, kRows = 5;           // of the sites' grid
constexpr double kSpacing = 620, kScatter = 130; // metres
constexpr double kSlowest = 11, kFastest = 31;   // m/s
constexpr double kStart = 1.9;                   // radians; at home, half a minute before the border in the north

Place onRing(double angle)
{
    return {kEast * std::cos(angle), kNorth * std::sin(angle)};
}

} // namespace

// Test networks: 001 is the test country code, 999 that of private networks (ITU-T E.212).
const Plmn World::kHome{1, 1, 2};
const Plmn World::kAbroad{999, 102, 3};

double distance(Place one, Place other)
{
    return std::hypot(one.x - other.x, one.y - other.y);
}

World::World(Random random) : _random(random), _car(onRing(kStart)), _angle(kStart)
{
    for (int row = 0; row < kRows; ++row)
        for (int column = 0; column < kColumns; ++column) {
            // Every second row is shifted by half a cell, so that the cells are hexagons.
            const double x = (column + 0.5 * (row % 2) - 0.5 * (kColumns - 0.5)) * kSpacing;
            const double y = (row - 0.5 * (kRows - 1)) * kSpacing;
            const Place place{x + kScatter * _random.between(-1, 1), y + kScatter * _random.between(-1, 1)};
            const bool town = column % 3 != 0;
            _sites.push_back({place, place.x > 0, place.y > 0 ? 1 : 0, town});
        }
}

// Clockwise, from home in the north-west across the border to the east. The speed varies.
void World::drive(double seconds)
{
    _speed = std::clamp(_speed + 1.2 * std::sqrt(seconds) * _random.normal(), kSlowest, kFastest);
    const double metres = _speed * seconds;
    const double perRadian = std::hypot(kEast * std::sin(_angle), kNorth * std::cos(_angle));
    _angle -= metres / perRadian;
    _way += metres;
    _car = onRing(_angle);
}

const Plmn& World::plmn(std::size_t site) const
{
    return _sites[site].abroad ? kAbroad : kHome;
}

} // namespace kestrum
