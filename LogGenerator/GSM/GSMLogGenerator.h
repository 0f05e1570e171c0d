#pragma once

#include "LogGenerator/LogGenerator.h"

namespace kestrum {

/// The IFX technology, whose modem decodes for itself: each channel message is a property list that holds the
/// complete display.
class GSMLogGenerator final : public LogGenerator {
public:
    static std::unique_ptr<GSMLogGenerator> generator(DecodingRoles& roles);

    std::string_view technology() const override;

    /// Throws AssertionFailure for a message that is no property list, or holds what a display cannot; the state
    /// then keeps its display.
    void updateState(State& state, Bytes withData) override;
    Value generateLogUsingState(State& state) override;
    DictionaryRef getStartCommand() const override;
    /// The history alone: there are no raw records to make a DLF of.
    ArrayRef getSaveContentsFromState(const State& state) const override;

    /// A tidied copy of a received tree: dictionaries of one entry give way to their value, below the root, and the
    /// first element of every array is left out. Throws AssertionFailure for anything but dictionaries, arrays and
    /// strings.
    static Value processObject(const Value& object);
    /// The value of a dictionary with exactly one entry; null for anything else.
    static Value canCollapse(const Value& object);

private:
    using LogGenerator::LogGenerator;

    Value _spent; ///< the message before the last one, for the next to be made of
};

} // namespace kestrum
