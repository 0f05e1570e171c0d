#pragma once

#include "voxd/scenarios/Random.h"

namespace kestrum {

/// The use of the phone: idle for a while, then a call or data, repeated.
class Traffic {
public:
    enum class Phase { Idle, Setup, Active, Release };

    explicit Traffic(Random random) : _random(random) { begin(Phase::Idle); }

    /// Returns whether the phase has changed.
    bool pass(double seconds);

    Phase phase() const { return _phase; }
    bool isIdle() const { return _phase == Phase::Idle; }
    bool isActive() const { return _phase == Phase::Active; }
    /// The kind of the phase after idle: a call or data.
    bool isVoice() const { return _voice; }
    bool isData() const { return !_voice; }
    /// Active data as a share of the link's capacity: 0 to 1.
    double load() const { return isActive() && isData() ? _load : 0; }

private:
    void begin(Phase phase);

    Random _random;
    Phase _phase = Phase::Idle;
    double _remaining = 0; // seconds left in the phase
    bool _voice = true;
    double _load = 0.5;
};

} // namespace kestrum
