#include "insight/Events.h"

#include "capture/MessageTime.h"
#include "insight/NumberIn.h"
#include "platform/ChannelMessage.h"
#include "platform/TelephonyService.h"
#include "support/Format.h"

#include <algorithm>
#include <array>

namespace kestrum {
namespace {

constexpr std::string_view kStreaming = "streaming", kSilent = "silent";
constexpr std::string_view kConnectedText = "connected", kLostText = "lost";

/// "12.3 s"
std::string secondsText(std::chrono::microseconds time)
{
    return formatted("%.1f s", std::chrono::duration<double>(time).count());
}

std::vector<WatchedPlace> watched(std::span<const Place> places)
{
    return {places.begin(), places.end()};
}

/// The text of a part of a cell's identity: without the unit, "424" of "424 × 64chips".
std::string_view identityIn(std::string_view text)
{
    const bool isNumber = !text.empty() && text.front() >= '0' && text.front() <= '9';
    return isNumber ? text.substr(0, text.find(' ')) : text;
}

} // namespace

bool isCellChange(const Event& event)
{
    return event.kind == EventKind::ServingCell || event.kind == EventKind::Reselection ||
           event.kind == EventKind::Handover;
}

std::string titleOf(const Event& event)
{
    const auto kind = word(event.kind);
    return event.name == kind ? std::string(kind) : formatted("%@ (%@)", kind, event.name);
}

void Events::add(Event event)
{
    _events.push_back(std::move(event));
    if (_events.size() > kMost) {
        _events.pop_front();
        ++_dropped;
    }
}

std::string EventFinder::Serving::text() const
{
    std::string all;
    for (std::size_t i = 0; i < known.size(); ++i)
        if (!known[i].empty())
            all += formatted("%s%@ %@", all.empty() ? "" : ", ", table->identity[i].name, identityIn(known[i]));
    return all.empty() ? all : formatted("%@ %@", table->radio, all);
}

/// Whether the places still show the known cell.
bool EventFinder::Serving::isSame() const
{
    const auto isKnown = [this](std::size_t i) { return !known[i].empty() && !identity[i].text().empty(); };
    std::size_t count = table->decisive;
    for (std::size_t i = 0; i < table->decisive; ++i)
        if (!isKnown(i))
            count = identity.size();
    for (std::size_t i = 0; i < count; ++i)
        if (isKnown(i) && known[i] != identity[i].text())
            return false;
    return true;
}

void EventFinder::look(const LogGenerator& generator, const State& state, Bytes message)
{
    // Nearly all messages end here: their codes reach no place of the table, or none whose reading has changed.
    if (const auto read = ChannelMessage::read(message)) {
        const auto stamp = read->timeStamp().value_or(0);
        const auto& recent = _recent[read->logCode % _recent.size()];
        // Unsigned: a step back is a long way forward.
        if (stamp - _stamp < stampsIn(kSilence) && recent.code == read->logCode &&
            (recent.reach == nullptr || isQuiet(*recent.reach))) {
            _stamp = stamp;
            if (recent.reach == nullptr || !isSampleDue(*recent.reach))
                return;
        }
    }
    lookAgain(generator, state, message);
}

bool EventFinder::isQuiet(const Reach& reach) const
{
    if ((reach.camped != nullptr && reach.camped != _camped) || (reach.implied != nullptr && reach.implied != _implied))
        return false;
    return std::ranges::all_of(reach.places, &WatchedPlace::isUnchanged);
}

/// A changed reading, or a sample of the levels; then it also finds a new display. Parts of earlier displays, which the
/// history keeps alive, would never change.
void EventFinder::lookAgain(const LogGenerator& generator, const State& state, Bytes message)
{
    const auto read = ChannelMessage::read(message);
    if (generator.technology() == kVoxLogChannelTechnology_IFX)
        return look(generator, state, std::nullopt, timeOf(state.at(StateKey::kDisplay)));
    if (read)
        look(generator, state, read->isOfKnownType() ? std::optional(read->logCode) : std::nullopt, timeOf(*read));
}

void EventFinder::look(const LogGenerator& generator, const State& state, std::optional<LogCode> code,
                       std::optional<Date> time)
{
    catchUp();
    _now = time;
    if (time) {
        pass(*time);
        _stamp = *time > dateFromTimeStamp(0) ? timeStampFromDate(*time) : 0;
    } else if (std::exchange(_isSilent, false)) {
        note(EventKind::Silence, "log", kSilent, kStreaming);
    }
    lookAt(generator, state, code);
}

/// To the last message, which may have been a quiet one.
void EventFinder::catchUp()
{
    if (_stamp != 0)
        _time = std::max(*_time, dateFromTimeStamp(_stamp));
}

void EventFinder::lookAt(const LogGenerator& generator, const State& state, std::optional<LogCode> code)
{
    const Value* display = state.find(StateKey::kDisplay);
    const auto* shown = display != nullptr ? display->borrowedDictionary() : nullptr;
    if (shown == nullptr)
        return;
    if (shown != _display.dictionary())
        adopt(*display, generator.technology());
    if (_table == nullptr)
        return;
    const Reach* reach = reachOf(code, generator);
    if (reach == nullptr)
        return;

    // The cell first: the messages before tell whether a channel was in use.
    if (reach->camped != nullptr && reach->camped != _camped)
        camp(*reach->camped);
    for (const auto& [serving, places] : reach->cells) {
        bool isSame = true;
        for (auto* place : places)
            isSame &= place->look() == WatchedPlace::Seen::Same;
        if (!isSame)
            compare(*serving);
    }
    if (reach->implied != nullptr && reach->implied != _implied)
        imply(*reach->implied);
    for (const auto& [followed, places] : reach->values) {
        auto seen = WatchedPlace::Seen::Same;
        for (auto* place : places)
            seen = std::max(seen, place->look());
        if (seen != WatchedPlace::Seen::Same)
            compare(*followed, seen == WatchedPlace::Seen::Changed);
    }
    if (isSampleDue(*reach))
        sample(*reach);
}

void EventFinder::connected(bool isConnected, std::optional<Date> at)
{
    if (std::exchange(_isConnected, isConnected) == isConnected)
        return;
    _now = at;
    note(EventKind::Connection, "log channel", isConnected ? kLostText : kConnectedText,
         isConnected ? kConnectedText : kLostText);
}

const Cells& EventFinder::cells()
{
    catchUp();
    for (auto& each : _serving)
        if (each.visit != nullptr)
            each.visit->count(_time, _time);
    return _cells;
}

void EventFinder::silent()
{
    catchUp();
    const bool hasSeen = _time || _display.dictionary() != nullptr;
    if (!hasSeen || std::exchange(_isSilent, true))
        return;
    _stamp = 0; // the next message is no quiet one
    _now = _time;
    note(EventKind::Silence, "log", kStreaming, kSilent);
}

void EventFinder::pass(Date time)
{
    const auto before = std::exchange(_time, time);
    if (!before || (time >= *before && time - *before < kSilence && !_isSilent))
        return;
    for (auto& each : _serving)
        if (each.visit != nullptr)
            each.visit->count(before, time);
    const bool isClockSet = time < *before || time - *before > kClockSet;
    if (isClockSet && !_isSilent)
        return;
    if (!std::exchange(_isSilent, false)) {
        _now = before;
        note(EventKind::Silence, "log", kStreaming, kSilent);
        _now = time;
    }
    if (isClockSet)
        return note(EventKind::Silence, "log", kSilent, kStreaming);
    note(EventKind::Silence, "log", formatted("silent for %@", secondsText(time - *before)), kStreaming);
}

void EventFinder::adopt(const Value& display, std::string_view technology)
{
    _display = SectionRef(display);
    const auto* table = eventTableOf(technology);
    if (table != _table)
        useTable(table);
    forEachPlace([&](WatchedPlace& place) { place.findIn(display); });
    _reaches.clear();
    _recent.fill({});
}

void EventFinder::useTable(const EventTable* table)
{
    for (auto& each : _serving)
        leave(each);
    const auto nameOf = [](const EventTable* each) { return std::string(each != nullptr ? each->name : ""); };
    note(EventKind::Technology, "technology", nameOf(_table), nameOf(table));
    _table = table;
    _serving.clear();
    _followed.clear();
    _all.reset();
    _camped = nullptr;
    _implied = nullptr;
    if (table == nullptr)
        return;
    for (const auto& each : table->cells) {
        auto& serving = _serving.emplace_back(Serving{&each});
        for (const auto& part : each.identity)
            serving.identity.emplace_back(part.place);
        for (const auto& level : each.levels)
            serving.levels.push_back({watched(level.places), nullptr, {}, 0});
        if (!each.state.path.empty())
            serving.state.emplace(each.state);
        serving.known.resize(each.identity.size());
    }
    for (const auto& values : {table->values, table->liveModemValues})
        for (const auto& each : values)
            _followed.push_back({&each, watched(each.parts)});
}

template <typename Use>
void EventFinder::forEachPlace(Use use)
{
    for (auto& each : _serving) {
        std::ranges::for_each(each.identity, use);
        for (auto& level : each.levels)
            std::ranges::for_each(level.places, use);
        if (each.state)
            use(*each.state);
    }
    for (auto& each : _followed)
        std::ranges::for_each(each.parts, use);
}

const EventFinder::Reach* EventFinder::reachOf(std::optional<LogCode> code, const LogGenerator& generator)
{
    if (!code) {
        if (!_all)
            _all = makeReach(code, generator);
        return _all.get();
    }
    auto& recent = _recent[*code % _recent.size()];
    if (recent.code != *code) {
        auto known = _reaches.find(*code);
        if (known == _reaches.end())
            known = _reaches.emplace(*code, makeReach(code, generator)).first;
        recent = {*code, known->second.get()};
    }
    return recent.reach;
}

/// Null when the code reaches nothing.
std::unique_ptr<const EventFinder::Reach> EventFinder::makeReach(std::optional<LogCode> code,
                                                                 const LogGenerator& generator)
{
    Reach reach;
    const auto nodes = code ? generator.nodesOf(*code) : std::nullopt;
    const auto isReached = [&](const WatchedPlace& place) { return !code || place.isReachedBy(*code, nodes); };
    const auto reached = [&](std::vector<WatchedPlace>& places) {
        std::vector<WatchedPlace*> found;
        for (auto& each : places)
            if (isReached(each))
                found.push_back(&each);
        return found;
    };
    for (auto& serving : _serving) {
        if (code && serving.table->campedBy == *code)
            reach.camped = &serving;
        if (auto places = reached(serving.identity); !places.empty())
            reach.cells.emplace_back(&serving, std::move(places));
        for (auto& level : serving.levels)
            for (const auto* place : reached(level.places))
                reach.levels.push_back({&serving, &level, place});
    }
    for (auto& followed : _followed)
        if (auto places = reached(followed.parts); !places.empty())
            reach.values.emplace_back(&followed, std::move(places));
    const auto implied = std::ranges::find(_table->rrcStates, code.value_or(0), &ImpliedState::code);
    if (implied != _table->rrcStates.end())
        reach.implied = implied->state;
    for (const auto& [serving, places] : reach.cells)
        reach.places.insert(reach.places.end(), places.begin(), places.end());
    for (const auto& [followed, places] : reach.values)
        reach.places.insert(reach.places.end(), places.begin(), places.end());
    if (!reach.levels.empty())
        reach.paced = reach.levels.front().level;
    if (reach.isEmpty())
        return nullptr;
    return std::make_unique<const Reach>(std::move(reach));
}

/// Another radio access serves.
void EventFinder::camp(Serving& now)
{
    std::string was;
    auto kind = EventKind::ServingCell;
    if (_camped != nullptr) {
        kind = isConnected(*_camped) ? EventKind::Handover : EventKind::Reselection;
        was = _camped->text();
        note(EventKind::Technology, "radio access", _camped->table->radio, now.table->radio);
        leave(*_camped);
    }
    _camped = &now;
    for (auto& place : now.identity)
        place.look();
    begin(now, kind, was);
}

void EventFinder::begin(Serving& serving, EventKind kind, std::string_view was)
{
    for (std::size_t i = 0; i < serving.known.size(); ++i)
        serving.known[i] = serving.identity[i].text();
    const auto is = serving.text();
    if (is.empty())
        return;
    note(kind, serving.table->radio, was, is);
    std::string key;
    const auto decisive = serving.known.begin() + static_cast<std::ptrdiff_t>(serving.table->decisive);
    const bool isDecided = std::find(serving.known.begin(), decisive, std::string()) == decisive;
    for (auto part = serving.known.begin(); part != (isDecided ? decisive : serving.known.end()); ++part)
        key += *part + '\n';
    for (auto& level : serving.levels) {
        level.reading.reset();
        level.sampled = 0;
    }
    serving.visit = &_cells.enter(serving.table->radio, std::move(key), _now);
    serving.visit->identity = is.substr(serving.table->radio.size() + 1);
}

void EventFinder::compare(Serving& serving)
{
    if (serving.table->campedBy != 0 && &serving != _camped)
        return;
    if (serving.visit == nullptr)
        return begin(serving, EventKind::ServingCell, {});
    if (serving.isSame()) {
        for (std::size_t i = 0; i < serving.known.size(); ++i)
            serving.known[i] = serving.identity[i].text();
        serving.visit->identity = serving.text().substr(serving.table->radio.size() + 1);
        return;
    }
    const auto kind = isConnected(serving) ? EventKind::Handover : EventKind::Reselection;
    const auto was = serving.text();
    leave(serving);
    begin(serving, kind, was);
}

void EventFinder::leave(Serving& serving)
{
    if (serving.visit != nullptr)
        Cells::leave(*std::exchange(serving.visit, nullptr), _now);
}

bool EventFinder::isConnected(const Serving& serving) const
{
    const Value* state = serving.state ? serving.state->value() : nullptr;
    const auto text =
        state != nullptr ? state->text().value_or("") : std::string(_implied != nullptr ? _implied->text : "");
    return std::ranges::find(serving.table->connected, text) != serving.table->connected.end();
}

void EventFinder::imply(const StateName& state)
{
    if (_implied != nullptr)
        note(EventKind::RrcState, "RRC state", _implied->text, state.text);
    _implied = &state;
}

void EventFinder::compare(Followed& followed, bool isChange)
{
    std::string now;
    for (const auto& part : followed.parts) {
        const std::string_view text = part.text();
        if (!text.empty())
            now += formatted("%s%@", now.empty() ? "" : "-", text.substr(0, text.find_last_not_of(' ') + 1)); // "01 "
    }
    if (followed.value->wordOf != nullptr)
        now = followed.value->wordOf(now);
    const auto before = std::exchange(followed.shown, now);
    if (isChange && before != now)
        note(followed.value->kind, followed.value->name, before, now);
}

void EventFinder::sample(const Reach& reach)
{
    reach.paced->sampled = _stamp;
    for (const auto& each : reach.levels)
        sample(each);
}

void EventFinder::sample(const Reach::Sample& at)
{
    const Value* value = at.place->value();
    if (value == nullptr)
        return;
    auto& level = *at.level;
    level.latest = at.place;
    auto* visit = at.cell->visit;
    if (&level != &at.cell->levels.front() || visit == nullptr)
        return;
    const auto* reading = value->borrowedReading();
    if (reading == nullptr || level.reading != *reading) {
        level.reading.reset();
        const auto measure = numberIn(*value);
        if (!measure)
            return;
        level.number = measure->number;
        if (visit->unit.empty())
            visit->unit = shortened(measure->unit, kLongestText);
        if (reading != nullptr)
            level.reading = *reading;
    }
    visit->level.add(level.number);
}

std::string EventFinder::levelsNow() const
{
    std::string all;
    for (const auto& serving : _serving) {
        if (serving.visit == nullptr)
            continue;
        for (std::size_t i = 0; i < serving.levels.size(); ++i) {
            const auto& level = serving.levels[i];
            const Value* value = level.latest != nullptr ? level.latest->value() : nullptr;
            if (value == nullptr || !numberIn(*value))
                continue;
            all += all.empty() ? "" : ", ";
            if (_serving.size() > 1)
                all += formatted("%@ ", serving.table->radio);
            all += formatted("%@ %@", serving.table->levels[i].name, *value->text());
        }
    }
    return shortened(all, kLongestText);
}

void EventFinder::note(EventKind kind, std::string_view name, std::string_view was, std::string_view is)
{
    _events.add({_now, kind, name, shortened(was, kLongestText), shortened(is, kLongestText), levelsNow()});
}

} // namespace kestrum
