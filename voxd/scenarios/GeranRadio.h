#pragma once

#include "support/Value.h"
#include "voxd/scenarios/Cells.h"
#include "voxd/scenarios/Coverage.h"
#include "voxd/scenarios/Modem.h"
#include "voxd/scenarios/Random.h"
#include "voxd/scenarios/Traffic.h"

namespace kestrum {

/// The GSM side of a GSM/UMTS modem: its serving cell, and the records of its radio resource layer.
class GeranRadio {
public:
    GeranRadio(const World& world, Random random);

    void receive() { _coverage.move(); }
    void camp() { _serving.choose(_coverage.strongest()); }
    /// Returns whether the serving cell has changed.
    bool follow() { return _serving.follow(_coverage); }
    std::size_t site() const { return _serving.site(); }
    GsmCell cell() const { return gsmCell(_world, site()); }

    /// Logs the facts about a cell that its system information gives.
    void logServingCell(ModemLog& log, const Traffic& traffic);
    /// Logs the records that depend on the traffic.
    void logState(ModemLog& log, const Traffic& traffic);
    /// The layer's state while GSM is not in use, or during a change to or from UMTS (values of 0x512C).
    enum State {
        Inactive = 0,
        Idle = 5,
        Reselection = 6,
        Pending = 7,
        Transfer = 9,
        Release = 11,
        FromUmts = 14,
        ToUmts = 18,
    };
    RecordWriter state(State state, bool data) const;
    void tick(ModemLog& log, unsigned number, const Traffic& traffic);

    /// The entry for the cell monitor.
    DictionaryRef servingReport() const;
    void reportNeighbors(Array& into);
    /// The candidates for reselection, GSM and UMTS.
    RecordWriter ranking();

private:
    std::vector<std::size_t> neighbors() const;
    double level(std::size_t site) const { return _coverage.level(site); }
    RecordWriter measurement(const Traffic& traffic);
    RecordWriter neighborColours() const;
    RecordWriter identity() const;
    RecordWriter dedicatedChannel() const;
    RecordWriter hopping(bool dedicated) const;
    RecordWriter discontinuousTransmission(bool on) const;
    void logPacketParameters(ModemLog& log) const;

    const World& _world;
    Random _random;
    Coverage _coverage;
    ServingCell _serving;
};

} // namespace kestrum
