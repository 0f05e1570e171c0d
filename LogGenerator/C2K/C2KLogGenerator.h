#pragma once

#include "LogGenerator/ZPHLogGenerator.h"

#include <string_view>

namespace kestrum {

/// CDMA2000 1x and EV-DO (3GPP2) by binary records. It has no sections: the template "C2KTemplate" names display
/// values by lookup identifiers, under which one decoder for each log code publishes.
class C2KLogGenerator final : public ZPHLogGenerator {
public:
    static std::unique_ptr<C2KLogGenerator> generator(DecodingRoles& roles);

    std::string_view technology() const override;

    void updateState(State& state, Bytes withData) override;
    /// Checks one channel message, routes its record by log code, and keeps it for the history when its code is one
    /// of the eight that are decoded.
    void updateFromLog(Bytes message, const DictionaryRef& usingLookup, State& usingState);
    Value generateLogUsingState(State& state) override;
    DictionaryRef getStartCommand() const override;

    /// Fills the display from the template and, for each identifier in it, the lookup with the places where it
    /// stands: {"key": the display key, "dict": the dictionary that holds it}.
    void processTemplate(const Dictionary& templateNode, const DictionaryRef& storeDisplayIntoDict,
                         Dictionary& storeLookupIntoDict) const;
    /// The display in the state, made from the template on first use; null when that cannot be loaded.
    Value getDisplayFromState(State& state) const;

private:
    using ZPHLogGenerator::ZPHLogGenerator;
};

} // namespace kestrum
