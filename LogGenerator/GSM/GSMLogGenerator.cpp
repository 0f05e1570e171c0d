#include "LogGenerator/GSM/GSMLogGenerator.h"

#include "LogGenerator/Failures.h"
#include "platform/PropertyLists.h"
#include "platform/SystemLog.h"
#include "platform/TelephonyService.h"
#include "support/Format.h"

#include <utility>

namespace kestrum {
namespace {

// Kept: the line numbers are part of the message of a failed assertion. They are not lines of this file.
constexpr const char* kSourceFile = "LogGenerator/GSM/GSMLogGenerator";
constexpr int kUnknownObjectLine = 78;
constexpr int kNoObjectLine = 90;

Value collapsed(const Value& object)
{
    const Value only = GSMLogGenerator::canCollapse(object);
    return only ? only : object;
}

} // namespace

std::unique_ptr<GSMLogGenerator> GSMLogGenerator::generator(DecodingRoles& roles)
{
    return std::unique_ptr<GSMLogGenerator>(new GSMLogGenerator(roles));
}

std::string_view GSMLogGenerator::technology() const
{
    return kVoxLogChannelTechnology_IFX;
}

void GSMLogGenerator::updateState(State& state, Bytes withData)
{
    const Value received = _roles.propertyLists.parseOver(withData, std::exchange(_spent, {}));
    if (received.isNull())
        throw AssertionFailure(
            "updateState:withData:", formatted("<GSMLogGenerator: %p>", _roles.log.shownAddress(this)), kSourceFile,
            kNoObjectLine, "Could not deserialize the object");
    const Value processed = processObject(received);
    dropForeignDisplay(state);
    _spent = state.at(StateKey::kDisplayState);
    state.set(StateKey::kDisplayState, received);
    setDisplay(state, processed);
    state.set(StateKey::kExtraInfo, makeDictionary());
}

Value GSMLogGenerator::processObject(const Value& object)
{
    if (object.isText())
        return object;
    if (const auto dictionary = object.dictionary()) {
        auto processed = makeDictionary();
        for (const auto& [key, value] : *dictionary)
            processed->set(key, collapsed(processObject(value)));
        return processed;
    }
    if (const auto array = object.array()) {
        auto processed = makeArray();
        // Kept: the first element is always left out; field displays show it so.
        for (std::size_t i = 1; i < array->size(); ++i)
            processed->append(collapsed(processObject((*array)[i])));
        return processed;
    }
    throw AssertionFailure("processObject:", "GSMLogGenerator", kSourceFile, kUnknownObjectLine,
                           formatted("Unknown object of type %@ encountered", nameOf(object.kind())));
}

Value GSMLogGenerator::canCollapse(const Value& object)
{
    const auto dictionary = object.dictionary();
    return dictionary && dictionary->size() == 1 ? dictionary->begin()->value : Value();
}

Value GSMLogGenerator::generateLogUsingState(State& state)
{
    dropForeignDisplay(state);
    updateHistoryInState(state);
    return state.at(StateKey::kDisplay);
}

DictionaryRef GSMLogGenerator::getStartCommand() const
{
    return makeDictionary({{"SetState", "Streaming"}});
}

ArrayRef GSMLogGenerator::getSaveContentsFromState(const State& state) const
{
    const auto history = state.at(StateKey::kHistory).array();
    return history ? std::make_shared<Array>(*history) : makeArray();
}

} // namespace kestrum
