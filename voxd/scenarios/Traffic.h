#pragma once

#include "voxd/scenarios/Random.h"

namespace kestrum {

/// What the car's passenger does with the phone: nothing for a while, then a call or some data, again and again.
class Traffic {
public:
    enum class Phase { Idle, Setup, Active, Release };

    explicit Traffic(Random random) : _random(random) { begin(Phase::Idle); }

    /// Whether the phase changed.
    bool pass(double seconds);

    Phase phase() const { return _phase; }
    bool isIdle() const { return _phase == Phase::Idle; }
    bool isActive() const { return _phase == Phase::Active; }
    /// Of the phase that is not idle: a call, or data.
    bool isVoice() const { return _voice; }
    bool isData() const { return !_voice; }
    /// Active data, as a part of what the link can carry: 0 to 1.
    double load() const { return isActive() && isData() ? _load : 0; }

private:
    void begin(Phase phase);

    Random _random;
    Phase _phase = Phase::Idle;
    double _remaining = 0; // seconds of the phase
    bool _voice = true;
    double _load = 0.5;
};

} // namespace kestrum
