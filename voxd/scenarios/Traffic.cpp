#include "voxd/scenarios/Traffic.h"

#include <algorithm>
#include <cmath>

namespace kestrum {
namespace {

struct Length {
    double shortest, longest; // seconds
};

// In the order of the enumeration Phase.
constexpr Length kLengths[] = {{5, 20}, {0.4, 1.2}, {6, 25}, {0.3, 0.8}};

} // namespace

bool Traffic::pass(double seconds)
{
    _load = std::clamp(_load + 0.4 * std::sqrt(seconds) * _random.normal(), 0.05, 1.0);
    _remaining -= seconds;
    if (_remaining > 0)
        return false;
    begin(static_cast<Phase>((static_cast<int>(_phase) + 1) % 4));
    return true;
}

void Traffic::begin(Phase phase)
{
    _phase = phase;
    // Calls and data alternate.
    if (phase == Phase::Setup)
        _voice = !_voice;
    const Length& length = kLengths[static_cast<std::size_t>(phase)];
    _remaining = _random.between(length.shortest, length.longest);
}

} // namespace kestrum
