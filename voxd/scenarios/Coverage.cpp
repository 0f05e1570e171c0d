#include "voxd/scenarios/Coverage.h"

#include <algorithm>
#include <cmath>
#include <functional>
#include <numeric>

namespace kestrum {
namespace {

constexpr double kShadowDeviation = 4.5; // dB
constexpr double kShadowDistance = 110;  // metres over which the shadowing changes completely
constexpr double kNearest = 0.12;        // km; closer, below the antenna's beam, the signal grows no stronger
constexpr double kAntennaHeight = 15;    // metres above the roofs
constexpr double kNothing = -139;        // dBm

// Path loss of macro cells in a town (3GPP TR 36.942).
double pathLoss(double kilometres, double megahertz)
{
    return 40 * (1 - 0.004 * kAntennaHeight) * std::log10(std::max(kilometres, kNearest)) -
           18 * std::log10(kAntennaHeight) + 21 * std::log10(megahertz) + 80;
}

} // namespace

double milliwatts(double dbm)
{
    return std::pow(10, dbm / 10);
}

double dbm(double milliwatts)
{
    return 10 * std::log10(milliwatts);
}

void ShadowFading::move(double metres, Random& random)
{
    const double kept = std::exp(-metres / kShadowDistance);
    _value = kept * _value + _deviation * std::sqrt(1 - kept * kept) * random.normal();
}

Coverage::Coverage(const World& world, Carrier carrier, Random random, bool townsOnly)
    : _world(world), _carrier(carrier), _townsOnly(townsOnly), _random(random), _way(world.way())
{
    const std::size_t count = world.sites().size();
    for (std::size_t i = 0; i < count; ++i)
        _shadows.emplace_back(kShadowDeviation, _random);
    _levels.resize(count);
    _order.resize(count);
    std::iota(_order.begin(), _order.end(), std::size_t{0});
    move();
}

void Coverage::move()
{
    const double metres = _world.way() - _way;
    _way = _world.way();
    _total = 0;
    for (std::size_t i = 0; i < _levels.size(); ++i) {
        _shadows[i].move(metres, _random);
        const Site& site = _world.sites()[i];
        const double loss = pathLoss(distance(_world.car(), site.place) / 1000, _carrier.frequency);
        _levels[i] =
            _townsOnly && !site.town ? kNothing : std::max(_carrier.power - loss + _shadows[i].value(), kNothing);
        _total += milliwatts(_levels[i]);
    }
    std::ranges::stable_sort(_order, std::greater(), [this](std::size_t site) { return _levels[site]; });
}

double Coverage::noiseAndAll(double noise) const
{
    return dbm(_total + milliwatts(noise));
}

std::vector<std::size_t> Coverage::others(std::size_t but, std::size_t count, double least) const
{
    std::vector<std::size_t> found;
    for (const std::size_t site : _order) {
        if (found.size() == count || level(site) < least)
            break;
        if (site != but)
            found.push_back(site);
    }
    return found;
}

bool ServingCell::follow(const Coverage& coverage)
{
    const std::size_t best = coverage.strongest();
    _better = best != _site && coverage.level(best) > coverage.level(_site) + _margin ? _better + 1 : 0;
    if (_better < _patience)
        return false;
    choose(best);
    return true;
}

} // namespace kestrum
