#pragma once

#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "doubles/DecodingDoubles.h"
#include "sections/RecordBuilder.h"

#include <gtest/gtest.h>

#include <string>

namespace kestrum {

/// A CDMA generator with a template that shows every identifier under its name.
class C2KRun {
public:
    explicit C2KRun(DictionaryRef templateNode = everyIdentifier())
    {
        doubles.bundle.paths = {"C2KTemplate.plist"};
        doubles.propertyLists.files["C2KTemplate.plist"] = std::move(templateNode);
        generator = C2KLogGenerator::generator(doubles.roles);
    }

    static DictionaryRef everyIdentifier()
    {
        auto all = makeDictionary();
        for (const char* identifier : {"kChannel",         "k1xEVDODeviceState",
                                       "kBandClass",       "kRxAGC0",
                                       "kRxAGC1",          "kTxAGC",
                                       "kServingPNOffset", "kSessionState",
                                       "kUATI24",          "kColorCode",
                                       "kActiveSetPilots", "kFingerC2I",
                                       "k1xDeviceState",   "k1xRx0BandClass",
                                       "k1xRx0ChanNum",    "k1xRxAGC0",
                                       "k1xRx1BandClass",  "k1xRx1ChanNum",
                                       "k1xRxAGC1",        "k1xTxAGC",
                                       "k1xActiveSetInfo", "k1xTrafficFER",
                                       "k1xRoamingHome",   "kSystemId",
                                       "kNetworkId",       "kPacketZoneId",
                                       "kBaseId",          "kProtocolRevision",
                                       "kFLDataRate",      "kRLDataRate"})
            all->set(identifier, identifier);
        return all;
    }

    template <typename Message>
    C2KRun& receive(const Message& message)
    {
        generator->updateState(state, message.bytes());
        return *this;
    }

    Value display() const { return state.at("Display"); }
    Value at(std::string_view identifier) const { return display().dictionary()->at(identifier); }
    /// The keys of a published dictionary with their values, "_sorted" included: "{"0;12": "+0.00 dB"}".
    std::string listAt(std::string_view identifier) const { return describe(at(identifier)); }

    DecodingDoubles doubles;
    State state;
    std::unique_ptr<C2KLogGenerator> generator;
};

} // namespace kestrum
