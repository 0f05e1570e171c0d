#pragma once

#include "LogGenerator/LogGenerator.h"

namespace kestrum {

/// The IFX technology. Its modem decodes the log itself: each channel message is a property list with the complete
/// display.
class GSMLogGenerator final : public LogGenerator {
public:
    static std::unique_ptr<GSMLogGenerator> generator(DecodingRoles& roles);

    std::string_view technology() const override;

    /// Throws AssertionFailure for a message that is no property list, or has values that a display cannot hold. The
    /// state then keeps its display.
    void updateState(State& state, Bytes withData) override;
    Value generateLogUsingState(State& state) override;
    DictionaryRef getStartCommand() const override;
    /// The history only: without raw records there is no DLF.
    ArrayRef getSaveContentsFromState(const State& state) const override;

    /// A simplified copy of a received tree: below the root a dictionary with one entry is replaced by its value, and
    /// the first element of every array is left out. Throws AssertionFailure for a value other than a dictionary, an
    /// array or a string.
    static Value processObject(const Value& object);
    /// The value of a dictionary with exactly one entry; null for anything else.
    static Value canCollapse(const Value& object);

private:
    using LogGenerator::LogGenerator;

    Value _spent; ///< the previous message; its containers are reused when the next one is parsed
};

} // namespace kestrum
