#include "LogGenerator/LogGenerator.h"

#include "platform/Clock.h"
#include "platform/SystemLog.h"
#include "support/Format.h"

namespace kestrum {
namespace {

constexpr std::size_t kHistoryLength = 5;

/// Beside "Display": {"Technology": who built it, "Display": that very container}.
constexpr std::string_view kOrigin = "DisplayOrigin";

bool isSameContainer(const Value& left, const Value& right)
{
    return left.kind() == right.kind() && left.dictionary() == right.dictionary() && left.array() == right.array();
}

} // namespace

LogGenerator::LogGenerator(DecodingRoles& roles) : _roles(roles)
{
    _roles.log.write(Priority::Warning, "Creating Log object: %p", _roles.log.shownAddress(this));
}

void LogGenerator::updateHistoryInState(State& state) const
{
    auto history = state.at("History").array();
    if (!history) {
        history = makeArray();
        state.set("History", history);
    }
    if (history->size() >= kHistoryLength)
        history->removeFirst(history->size() - (kHistoryLength - 1));

    const auto date = dateText(_roles.clock.now());
    history->append(makeDictionaryUntilNull({{"DisplayState", shallowCopy(state.at("DisplayState"))},
                                             {"Display", shallowCopy(state.at("Display"))},
                                             {"ExtraInfo", shallowCopy(state.at("ExtraInfo"))},
                                             {"Date", date},
                                             {"Description", formatted("Snapshot (%@)", date)}}));
}

LogGenerator::Origin LogGenerator::originOfDisplay(const State& state) const
{
    const Value* display = state.find("Display");
    if (display == nullptr || display->isNull())
        return Origin::None;
    const auto origin = state.at(kOrigin).dictionary();
    if (!origin || !isSameContainer(origin->at("Display"), *display))
        return Origin::Unknown;
    return origin->at("Technology") == Value(technology()) ? Origin::Own : Origin::Other;
}

void LogGenerator::setDisplay(State& state, Value display) const
{
    state.set("Display", display);
    state.set(kOrigin, makeDictionary({{"Technology", technology()}, {"Display", std::move(display)}}));
}

void LogGenerator::dropForeignDisplay(State& state) const
{
    if (originOfDisplay(state) != Origin::Other)
        return;
    for (const auto key : {"Display", "DisplayState", "ExtraInfo", "Template", "Lookup"})
        state.remove(key);
    state.remove(kOrigin);
}

} // namespace kestrum
