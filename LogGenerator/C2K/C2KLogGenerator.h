#pragma once

#include "LogGenerator/ZPHLogGenerator.h"

#include <string_view>

namespace kestrum {

/// CDMA2000 1x and EV-DO (3GPP2) from binary records. It has no sections: the template "C2KTemplate" contains lookup
/// identifiers, and one decoder for each log code publishes values under them.
class C2KLogGenerator final : public ZPHLogGenerator {
public:
    static std::unique_ptr<C2KLogGenerator> generator(DecodingRoles& roles);

    std::string_view technology() const override;

    void updateState(State& state, Bytes withData) override;
    /// Checks one channel message and decodes its record by log code. Keeps it for the history when one of the eight
    /// decoders takes it.
    void updateFromLog(Bytes message, const DictionaryRef& usingLookup, State& usingState);
    Value generateLogUsingState(State& state) override;
    DictionaryRef getStartCommand() const override;

    /// Fills the display from the template, and the lookup with the places of each identifier in the display:
    /// {"key": the display key, "dict": the dictionary that holds it}.
    void processTemplate(const Dictionary& templateNode, const DictionaryRef& storeDisplayIntoDict,
                         Dictionary& storeLookupIntoDict) const;
    /// The display in the state, built from the template on first use; null when the template cannot be loaded.
    Value getDisplayFromState(State& state) const;

private:
    using ZPHLogGenerator::ZPHLogGenerator;
};

} // namespace kestrum
