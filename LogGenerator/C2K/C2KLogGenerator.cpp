#include "LogGenerator/C2K/C2KLogGenerator.h"

#include "LogGenerator/C2K/Decoders.h"
#include "platform/Bundle.h"
#include "platform/ChannelMessage.h"
#include "platform/PropertyLists.h"
#include "platform/SystemLog.h"
#include "platform/TelephonyService.h"
#include "support/Format.h"

#include <algorithm>

namespace kestrum {
namespace {

/// A log code and its decoder.
struct Decoder {
    LogCode code;
    void (*decode)(Record record, C2KContext& context);
};

// In the order in which the start command asks for them.
constexpr Decoder kDecoders[] = {
    {0x108A, decodeFingers},         {0x1183, decodeEvdoStatus},     {0x1192, decodeForwardLinkRate},
    {0x12B6, decodeActiveSetPilots}, {0x119C, decodeOneXStatus},     {0x119D, decodeTrafficDemodulation},
    {0x127E, decodeReverseLinkRate}, {0x134F, decodeSystemIdentity},
};

} // namespace

std::unique_ptr<C2KLogGenerator> C2KLogGenerator::generator(DecodingRoles& roles)
{
    return std::unique_ptr<C2KLogGenerator>(new C2KLogGenerator(roles));
}

std::string_view C2KLogGenerator::technology() const
{
    return kVoxLogChannelTechnology_Zephra_CDMA;
}

void C2KLogGenerator::updateState(State& state, Bytes withData)
{
    getDisplayFromState(state);
    updateFromLog(withData, state.at(StateKey::kLookup).dictionary(), state);
}

void C2KLogGenerator::updateFromLog(Bytes message, const DictionaryRef& usingLookup, State& usingState)
{
    const auto read = ChannelMessage::read(message);
    if (!read)
        return;
    // Kept: such a message is logged, and its record is still decoded by its code.
    if (read->type != ChannelMessage::kOrdinary)
        _roles.log.write(Priority::Error, "Invalid log type: %x. Dropping.", read->type);
    const auto* decoder = std::ranges::find(kDecoders, read->logCode, &Decoder::code);
    if (decoder == std::end(kDecoders))
        return;
    C2KContext context(usingState, usingLookup, _roles);
    decoder->decode(read->record, context);
    appendToBinData(read->record.bytes());
}

void C2KLogGenerator::processTemplate(const Dictionary& templateNode, const DictionaryRef& storeDisplayIntoDict,
                                      Dictionary& storeLookupIntoDict) const
{
    for (const auto& [key, value] : templateNode) {
        if (const auto level = value.dictionary()) {
            auto display = makeDictionary();
            processTemplate(*level, display, storeLookupIntoDict);
            storeDisplayIntoDict->set(key, display);
        } else if (value == kSortedKey) {
            storeDisplayIntoDict->set(key, kSortedKey);
        } else if (const auto identifier = value.text()) {
            storeDisplayIntoDict->set(key, "");
            if (!storeLookupIntoDict.contains(*identifier))
                storeLookupIntoDict.set(*identifier, makeArray());
            storeLookupIntoDict.at(*identifier)
                .array()
                ->append(makeDictionary({{"key", key}, {"dict", storeDisplayIntoDict}}));
        }
    }
    _roles.log.write(Priority::Warning, "Processing the template");
}

Value C2KLogGenerator::getDisplayFromState(State& state) const
{
    dropForeignDisplay(state);
    if (Value existing = state.at(StateKey::kDisplay))
        return existing;

    Value loaded = state.at(StateKey::kTemplate);
    if (!loaded) {
        const auto path = _roles.bundle.pathForResource("C2KTemplate", "plist");
        loaded = path ? _roles.propertyLists.load(*path) : Value();
        if (!loaded.dictionary()) {
            _roles.log.write(Priority::Error, "Cannot load C2K template for display");
            return {};
        }
        state.set(StateKey::kTemplate, loaded);
    }
    auto display = makeDictionary(), lookup = makeDictionary();
    processTemplate(*loaded.dictionary(), display, *lookup);
    setDisplay(state, display);
    state.set(StateKey::kLookup, lookup);
    state.set(StateKey::kExtraInfo, makeDictionary());
    return display;
}

Value C2KLogGenerator::generateLogUsingState(State& state)
{
    const Value display = getDisplayFromState(state);
    moveBinDataToState(state);
    updateHistoryInState(state);
    return display;
}

DictionaryRef C2KLogGenerator::getStartCommand() const
{
    auto codes = makeArray();
    for (const auto& decoder : kDecoders)
        codes->append(decoder.code);
    return makeDictionary({{"SetState", "Streaming"}, {"SetZephraLogCodes", codes}});
}

} // namespace kestrum
