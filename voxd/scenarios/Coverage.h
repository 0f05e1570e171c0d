#pragma once

#include "voxd/scenarios/Random.h"
#include "voxd/scenarios/World.h"

#include <cstddef>
#include <span>
#include <vector>

namespace kestrum {

/// What the cells of one layer send.
struct Carrier {
    double frequency; ///< MHz
    double power;     ///< dBm of what is measured (a resource element, the pilot, the beacon), gains and car included
};

/// Shadows of houses and hills: a normal distribution in dB that stays alike over some 100 m (Gudmundson's model).
class ShadowFading {
public:
    ShadowFading(double deviation, Random& random) : _deviation(deviation), _value(deviation * random.normal()) {}

    void move(double metres, Random& random);
    double value() const { return _value; } ///< dB

private:
    double _deviation, _value;
};

/// How strongly the car receives the layer's cells, one on each site, or on each in a town.
class Coverage {
public:
    Coverage(const World& world, Carrier carrier, Random random, bool townsOnly = false);

    /// To be called whenever the world went on.
    void move();

    double level(std::size_t site) const { return _levels[site]; } ///< dBm
    double total() const { return _total; }                        ///< mW of all cells together
    double noiseAndAll(double noise) const;                        ///< dBm of all cells and `noise` dBm
    /// The sites, the strongest first.
    std::span<const std::size_t> order() const { return _order; }
    std::size_t strongest() const { return _order.front(); }
    /// The strongest sites but one, at most `count`, not below `least` dBm.
    std::vector<std::size_t> others(std::size_t but, std::size_t count, double least) const;

private:
    const World& _world;
    Carrier _carrier;
    bool _townsOnly;
    Random _random;
    double _way; // of the world, when it last moved
    std::vector<ShadowFading> _shadows;
    std::vector<double> _levels;
    std::vector<std::size_t> _order;
    double _total = 0;
};

/// The cell that serves: another takes over when it has been better by a margin for a while.
class ServingCell {
public:
    ServingCell(double margin, int patience) : _margin(margin), _patience(patience) {}

    std::size_t site() const { return _site; }
    void choose(std::size_t site)
    {
        _site = site;
        _better = 0;
    }
    /// To be called once for each move. Whether another cell serves now.
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
