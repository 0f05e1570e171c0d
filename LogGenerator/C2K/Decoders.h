#pragma once

#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/Row.h"
#include "support/Record.h"

#include <concepts>
#include <span>
#include <string>
#include <string_view>

namespace kestrum {

class SystemLog;

/// The input and output of a CDMA decoder. It publishes values under lookup identifiers; the template determines the
/// places of each identifier in the display.
class C2KContext {
public:
    C2KContext(State& runState, const DictionaryRef& places, DecodingRoles& roles)
        : state(runState), log(roles.log), _lookup(places), _watch(roles.watch)
    {}

    /// Sets the text at all places of the identifier. Stops at the first entry of the lookup that is no place.
    void publish(std::string_view identifier, std::string_view text) const;
    void publish(std::string_view identifier, Reading reading) const;
    /// The same; `set` changes the value at each place.
    template <std::invocable<Value&> Set>
    void publish(std::string_view identifier, Set set) const
    {
        atPlacesOf(identifier, [&set](Dictionary& node, const std::string& key) { set(node.slot(key)); });
    }
    /// Publishes the fields of the rows; the rows' keys are identifiers.
    void publish(Record record, std::span<const Row> rows) const;

    /// Reports a record of a wrong length: one line at error priority.
    void rejectLength(std::string_view line) const;

    State& state;
    SystemLog& log;

private:
    template <std::invocable<Dictionary&, const std::string&> Set>
    void atPlacesOf(std::string_view identifier, Set set) const;

    DictionaryRef _lookup;
    RecordWatch* _watch;
};

template <std::invocable<Dictionary&, const std::string&> Set>
void C2KContext::atPlacesOf(std::string_view identifier, Set set) const
{
    const Value* found = _lookup ? _lookup->find(identifier) : nullptr;
    const Array* places = found != nullptr ? found->borrowedArray() : nullptr;
    if (places == nullptr)
        return;
    for (const auto& place : *places) {
        const Dictionary* entry = place.borrowedDictionary();
        const Value* node = entry != nullptr ? entry->find("dict") : nullptr;
        const Value* key = entry != nullptr ? entry->find("key") : nullptr;
        Dictionary* dictionary = node != nullptr ? node->borrowedDictionary() : nullptr;
        if (dictionary == nullptr || key == nullptr || key->borrowedString() == nullptr)
            return;
        set(*dictionary, *key->borrowedString());
    }
}

// One decoder for each log code (3GPP2 C.S0005 for 1x, C.S0024 for EV-DO). A record of a wrong length logs one line and
// changes no value. Offsets count from the record's first byte, header included.
void decodeEvdoStatus(Record record, C2KContext& context);          // 0x1183
void decodeActiveSetPilots(Record record, C2KContext& context);     // 0x12B6
void decodeFingers(Record record, C2KContext& context);             // 0x108A
void decodeSystemIdentity(Record record, C2KContext& context);      // 0x134F
void decodeTrafficDemodulation(Record record, C2KContext& context); // 0x119D
void decodeForwardLinkRate(Record record, C2KContext& context);     // 0x1192
void decodeReverseLinkRate(Record record, C2KContext& context);     // 0x127E
void decodeOneXStatus(Record record, C2KContext& context);          // 0x119C

} // namespace kestrum
