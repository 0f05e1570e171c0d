#pragma once

#include "voxd/scenarios/Random.h"
#include "voxd/scenarios/World.h"

#include <cstddef>
#include <span>
#include <vector>

namespace kestrum {

/// The signal that the cells of one layer send.
struct Carrier {
    double frequency; ///< MHz
    /// dBm of the measured signal (a resource element, the pilot, the beacon), including the gains and the loss of
    /// the car
    double power;
};

/// Shadowing by houses and hills: normally distributed in dB, correlated over about 100 m (Gudmundson's model).
class ShadowFading {
public:
    ShadowFading(double deviation, Random& random) : _deviation(deviation), _value(deviation * random.normal()) {}

    void move(double metres, Random& random);
    double value() const { return _value; } ///< dB

private:
    double _deviation, _value;
};

/// The received level of a layer's cells in the car. The layer has a cell on every site, or only on those in a town.
class Coverage {
public:
    Coverage(const World& world, Carrier carrier, Random random, bool townsOnly = false);

    /// Call it after every move of the world.
    void move();

    double level(std::size_t site) const { return _levels[site]; } ///< dBm
    double total() const { return _total; }                        ///< mW of all cells together
    double noiseAndAll(double noise) const;                        ///< dBm of all cells and `noise` dBm
    /// The sites, the strongest first.
    std::span<const std::size_t> order() const { return _order; }
    std::size_t strongest() const { return _order.front(); }
    /// At most `count` of the strongest sites, without `but` and those below `least` dBm.
    std::vector<std::size_t> others(std::size_t but, std::size_t count, double least) const;

private:
    const World& _world;
    Carrier _carrier;
    bool _townsOnly;
    Random _random;
    double _way; // of the world at the last move
    std::vector<ShadowFading> _shadows;
    std::vector<double> _levels;
    std::vector<std::size_t> _order;
    double _total = 0;
};

/// The serving cell. Another cell replaces it after being stronger by a margin for some moves.
class ServingCell {
public:
    ServingCell(double margin, int patience) : _margin(margin), _patience(patience) {}

    std::size_t site() const { return _site; }
    void choose(std::size_t site)
    {
        _site = site;
        _better = 0;
    }
    /// Call it once per move. Returns whether the serving cell has changed.
    bool follow(const Coverage& coverage);

private:
    double _margin; // dB
    int _patience;  // moves
    std::size_t _site = 0;
    int _better = 0;
};

double milliwatts(double dbm);
double dbm(double milliwatts);

} // namespace kestrum
