#pragma once

namespace kestrum {

/// Who counts what becomes of records. The display needs none.
class RecordWatch {
public:
    virtual ~RecordWatch() = default;

    /// A decoder drops the record at hand, which is too short for it (or of a length that it does not know).
    virtual void tooShort() = 0;
};

} // namespace kestrum
