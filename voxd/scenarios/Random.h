#pragma once

#include <cmath>
#include <cstdint>
#include <numbers>

namespace kestrum {

/// Random numbers (splitmix64). Equal seeds give equal numbers on every machine, unlike the standard library's
/// distributions.
class Random {
public:
    explicit Random(std::uint64_t seed) : _state(seed) {}

    std::uint64_t bits()
    {
        std::uint64_t z = _state += 0x9E37'79B9'7F4A'7C15u;
        z = (z ^ (z >> 30)) * 0xBF58'476D'1CE4'E5B9u;
        z = (z ^ (z >> 27)) * 0x94D0'49BB'1331'11EBu;
        return z ^ (z >> 31);
    }
    /// 0 or above, below 1.
    double fraction() { return static_cast<double>(bits() >> 11) * 0x1p-53; }
    double between(double low, double high) { return low + (high - low) * fraction(); }
    /// From `low` to `high`, both included.
    int whole(int low, int high)
    {
        return low + static_cast<int>(bits() % (static_cast<std::uint64_t>(high - low) + 1));
    }
    bool chance(double probability) { return fraction() < probability; }
    /// Mean 0, standard deviation 1 (Box and Muller).
    double normal() { return std::sqrt(-2 * std::log(1 - fraction())) * std::cos(2 * std::numbers::pi * fraction()); }

private:
    std::uint64_t _state;
};

} // namespace kestrum
