#pragma once

#include "support/Value.h"
#include "voxd/scenarios/Cells.h"
#include "voxd/scenarios/Coverage.h"
#include "voxd/scenarios/Modem.h"
#include "voxd/scenarios/Random.h"
#include "voxd/scenarios/RrcState.h"
#include "voxd/scenarios/Traffic.h"

#include <array>

namespace kestrum {

/// The UMTS side of a GSM/UMTS modem: its serving cell, and the records of its radio resource layer.
class UtraRadio {
public:
    UtraRadio(const World& world, Random random);

    void receive() { _coverage.move(); }
    void camp() { _serving.choose(_coverage.strongest()); }
    /// Returns whether the serving cell has changed.
    bool follow() { return _serving.follow(_coverage); }
    std::size_t site() const { return _serving.site(); }
    UmtsCell cell() const { return umtsCell(_world, site()); }
    double level() const { return _coverage.level(site()); } ///< dBm RSCP
    double best() const { return _coverage.level(_coverage.strongest()); }

    void logServingCell(ModemLog& log);
    /// Logs the records that depend on the traffic. Null, while the phone is on GSM, means that the layer is
    /// disconnected.
    void logState(ModemLog& log, const Traffic* traffic);
    void tick(ModemLog& log, unsigned number, const Traffic& traffic);

    /// The entry for the cell monitor.
    DictionaryRef servingReport() const;
    void reportNeighbors(Array& into);

private:
    struct TransportChannel {
        std::uint32_t received, wrong; // blocks
    };
    std::vector<std::size_t> neighbors() const;
    double allPower() const;               ///< dBm in the channel
    double energy(std::size_t site) const; ///< dB Ec/Io
    RecordWriter searcher(RrcState state);
    RecordWriter ranking() const;
    RecordWriter identity() const;
    RecordWriter transmitPower();
    RecordWriter blockErrors();
    RecordWriter harq(const Traffic& traffic);

    const World& _world;
    Random _random;
    Coverage _coverage;
    ServingCell _serving;
    std::array<TransportChannel, 3> _channels{};
};

} // namespace kestrum
