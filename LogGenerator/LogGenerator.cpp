#include "LogGenerator/LogGenerator.h"

#include "platform/Clock.h"
#include "platform/SystemLog.h"
#include "support/Format.h"

namespace kestrum {
namespace {

constexpr std::size_t kHistoryLength = 5;

/// Key of {"Technology": the technology that built the display, "Display": the same container as under "Display"}.
constexpr std::string_view kOrigin = "DisplayOrigin";

bool isSameContainer(const Value& left, const Value& right)
{
    return left.kind() == right.kind() && left.borrowedDictionary() == right.borrowedDictionary() &&
           left.borrowedArray() == right.borrowedArray();
}

} // namespace

LogGenerator::LogGenerator(DecodingRoles& roles) : _roles(roles)
{
    _roles.log.write(Priority::Warning, "Creating Log object: %p", _roles.log.shownAddress(this));
}

void LogGenerator::updateHistoryInState(State& state) const
{
    auto history = state.at(StateKey::kHistory).array();
    if (!history) {
        history = makeArray();
        state.set(StateKey::kHistory, history);
    }
    if (history->size() >= kHistoryLength)
        history->removeFirst(history->size() - (kHistoryLength - 1));

    const auto date = dateText(_roles.clock.now());
    history->append(makeDictionaryUntilNull({{StateKey::kDisplayState, shallowCopy(state.at(StateKey::kDisplayState))},
                                             {StateKey::kDisplay, shallowCopy(state.at(StateKey::kDisplay))},
                                             {StateKey::kExtraInfo, shallowCopy(state.at(StateKey::kExtraInfo))},
                                             {StateKey::kDate, date},
                                             {StateKey::kDescription, formatted("Snapshot (%@)", date)}}));
}

LogGenerator::Origin LogGenerator::originOfDisplay(const State& state) const
{
    const Value* display = state.find(StateKey::kDisplay);
    if (display == nullptr || display->isNull())
        return Origin::None;
    const Value* origin = state.find(kOrigin);
    const Dictionary* built = origin != nullptr ? origin->borrowedDictionary() : nullptr;
    const Value* shown = built != nullptr ? built->find(StateKey::kDisplay) : nullptr;
    if (shown == nullptr || !isSameContainer(*shown, *display))
        return Origin::Unknown;
    const Value* builder = built->find("Technology");
    return builder != nullptr && *builder == technology() ? Origin::Own : Origin::Other;
}

void LogGenerator::setDisplay(State& state, Value display) const
{
    state.set(StateKey::kDisplay, display);
    state.set(kOrigin, makeDictionary({{"Technology", technology()}, {StateKey::kDisplay, std::move(display)}}));
}

void LogGenerator::dropForeignDisplay(State& state) const
{
    if (originOfDisplay(state) != Origin::Other)
        return;
    for (const char* key :
         {StateKey::kDisplay, StateKey::kDisplayState, StateKey::kExtraInfo, StateKey::kTemplate, StateKey::kLookup})
        state.remove(key);
    state.remove(kOrigin);
}

} // namespace kestrum
