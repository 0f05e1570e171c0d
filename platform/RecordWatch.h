#pragma once

namespace kestrum {

/// Counts records that decoders drop; used by kestrum-decode for its statistics.
class RecordWatch {
public:
    virtual ~RecordWatch() = default;

    /// A decoder drops the current record: it is too short, or of an unknown length.
    virtual void tooShort() = 0;
};

} // namespace kestrum
