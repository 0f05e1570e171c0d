#include "insight/Trend.h"

#include "insight/NumberIn.h"
#include "insight/keys/KeyEntry.h"
#include "support/Format.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <utility>

namespace kestrum {
namespace {

constexpr float kGap = std::numeric_limits<float>::quiet_NaN();
constexpr std::uint8_t kNoName = 0xFF;
constexpr std::string_view kOther = "(other)";

/// What a pane shows of a key: without the "n;" of the order.
std::string_view nameOf(std::string_view key, bool isSorted)
{
    const auto order = isSorted ? key.find(';') : key.npos;
    return order == key.npos ? key : key.substr(order + 1);
}

void appendStep(std::string& path, std::string_view name)
{
    path += '/';
    for (const char each : name) {
        if (each == '~')
            path += "~0";
        else if (each == '/')
            path += "~1";
        else
            path += each;
    }
}

/// The path with an index in place of each identity: as the key table knows rows.
std::string withIndexes(std::string_view path)
{
    std::string all;
    while (!path.empty()) {
        const auto step = path.substr(0, path.find('/', 1));
        all += step.find('=') != step.npos ? "/0" : step;
        path.remove_prefix(step.size());
    }
    return all;
}

/// Texts for "no value", which are gaps in words too.
bool isNothing(std::string_view text)
{
    const auto begin = text.find_first_not_of(' ');
    if (begin == text.npos)
        return true;
    text.remove_prefix(begin);
    return text == "Not Present" || text == "N/A" || text.starts_with("nan") || text.starts_with("inf") ||
           text.starts_with("-inf");
}

bool isWord(Kind kind)
{
    return kind == Kind::Identity || kind == Kind::State || kind == Kind::Text;
}

/// The last step, as a pane shows it.
std::string nameIn(std::string_view path)
{
    std::string name;
    for (auto at = path.rfind('/') + 1; at < path.size(); ++at) {
        const bool isEscaped = path[at] == '~' && at + 1 < path.size();
        name += !isEscaped ? path[at] : path[++at] == '1' ? '/' : '~';
    }
    return name;
}

} // namespace

/// Goes through a display and gives each value with its path.
class Trends::Walk {
public:
    Walk(Trends& trends, std::string_view technology) : _trends(trends), _technology(technology) {}

    void display(const Value& node)
    {
        if (const auto* dictionary = node.borrowedDictionary())
            in(*dictionary, *dictionary);
    }

    std::size_t left() const { return _left; }

    /// Whether it is a list as a tree of a modem has it: rows under numbers.
    static bool isList(const Dictionary& dictionary)
    {
        return !dictionary.empty() && std::ranges::all_of(dictionary, [](const auto& entry) {
            return !entry.key.empty() && entry.key.find_first_not_of("0123456789") == entry.key.npos &&
                   entry.value.borrowedDictionary() != nullptr;
        });
    }

    /// The step to a row: its identity, or its index where it has none, or the same as an earlier row.
    static std::string rowStep(const Dictionary* row, std::string_view index, const SectionEntry* list,
                               const Dictionary* beside, std::map<std::string, int>& seen)
    {
        std::string step;
        const auto add = [&step](std::string_view key, const Value* value) {
            const auto text = value != nullptr ? value->text() : std::nullopt;
            if (text && !text->empty() && text->size() <= kLongestName)
                step += formatted("%s%@=%@", step.empty() ? "" : ",", key, *text);
        };
        if (row != nullptr && list != nullptr) {
            for (const auto* each : list->identity())
                add(each->key, row->find(each->key));
            if (!step.empty() && list->channel && beside != nullptr)
                if (const Value* section = beside->find(list->channel->section);
                    section != nullptr && section->borrowedDictionary() != nullptr)
                    add(list->channel->key, section->borrowedDictionary()->find(list->channel->key));
        }
        if (step.empty())
            return std::string(index);
        if (const int count = ++seen[step]; count > 1)
            step += formatted("#%d", count);
        return step;
    }

private:
    void in(const Dictionary& dictionary, const Dictionary& beside)
    {
        if (isList(dictionary)) {
            const auto* entry = sectionEntry(_technology, _path);
            std::map<std::string, int> seen;
            for (const auto& [key, value] : dictionary)
                if (!isTooMany())
                    below(rowStep(value.borrowedDictionary(), key, entry, &beside, seen), value, beside);
            return;
        }
        const bool isSorted = dictionary.contains(kSortedKey);
        for (const auto& [key, value] : dictionary)
            if (key != kSortedKey)
                below(nameOf(key, isSorted), value, dictionary);
    }

    void in(const Array& list, const Dictionary& beside)
    {
        const auto* entry = sectionEntry(_technology, _path);
        std::map<std::string, int> seen;
        for (std::size_t i = 0; i < list.size(); ++i)
            if (!isTooMany())
                below(rowStep(list[i].borrowedDictionary(), std::to_string(i), entry, &beside, seen), list[i], beside);
    }

    /// Counts a row that is left out before its identity is looked for.
    bool isTooMany()
    {
        _left += _looked >= kMostLooked ? 1 : 0;
        return _looked >= kMostLooked;
    }

    void below(std::string_view name, const Value& value, const Dictionary& beside)
    {
        // The names alone may be long too.
        if (++_looked > kMostLooked || _path.size() + 2 * name.size() > kLongestPath) {
            ++_left;
            return;
        }
        const auto length = _path.size();
        appendStep(_path, name);
        if (const auto* dictionary = value.borrowedDictionary())
            in(*dictionary, beside);
        else if (const auto* list = value.borrowedArray())
            in(*list, beside);
        else
            leaf(value);
        _path.resize(length);
    }

    void leaf(const Value& value)
    {
        auto* series = _trends.seriesAt(_path, _technology);
        if (series == nullptr) {
            ++_left;
            return;
        }
        const auto measure = series->isOfWords ? std::nullopt : numberIn(value);
        if (measure)
            return _trends.add(*series, measure->number, measure->unit);
        const auto text = value.text();
        const bool isGap = !text || isNothing(*text);
        if (!series->exact.empty() || (isGap && series->words.empty()))
            return _trends.add(*series, std::numeric_limits<double>::quiet_NaN(), {});
        _trends.add(*series, isGap ? std::string_view() : std::string_view(*text));
    }

    Trends& _trends;
    const std::string_view _technology;
    std::string _path;
    std::size_t _looked = 0, _left = 0;
};

void Trends::sample(const Value& display, std::string_view technology, Date now)
{
    ++_refresh;
    _times[_refresh % kExact] = now;
    const Date minute = std::chrono::floor<std::chrono::minutes>(now);
    if (_refresh == 1 || minute != _minuteTimes[_minute % kMinutes])
        _minuteTimes[++_minute % kMinutes] = minute; // earlier than the one before when the clock was set back
    Walk walk(*this, technology);
    walk.display(display);
    _left = walk.left();
}

Trends::Series* Trends::seriesAt(std::string_view path, std::string_view technology)
{
    if (const auto known = _series.find(path); known != _series.end())
        return &known->second;
    if (_series.size() >= kMost && !dropOldest())
        return nullptr;
    auto& series = _series[std::string(path)];
    const auto* entry = keyEntryAt(technology, withIndexes(path));
    series.isOfWords = entry != nullptr && isWord(entry->kind);
    return &series;
}

// Looks for it once per refresh: a display with other keys each time must not cost a search for each of them.
bool Trends::dropOldest()
{
    if (_oldestOf != _refresh) {
        _oldestOf = _refresh;
        _old.clear();
        for (auto each = _series.begin(); each != _series.end(); ++each)
            if (each->second.last + 1 < _refresh)
                _old.push_back(each);
        std::ranges::sort(_old, std::greater(), [](const auto& each) { return each->second.last; });
    }
    // A series of the list may have been seen meanwhile.
    while (!_old.empty()) {
        const auto oldest = _old.back();
        _old.pop_back();
        if (oldest->second.last == _refresh)
            continue;
        _series.erase(oldest);
        ++_dropped;
        return true;
    }
    return false;
}

void Trends::add(Series& series, double number, std::string_view unit)
{
    if (std::isnan(number) && series.exact.empty()) {
        series.last = _refresh;
        return; // nothing has been measured yet
    }
    if (series.exact.empty()) {
        series.words.clear();
        series.names.clear();
        series.exact.assign(kExact, kGap);
    }
    const auto missed = std::min<std::uint64_t>(_refresh - series.last, kExact);
    for (std::uint64_t i = 1; i < missed; ++i)
        series.exact[(_refresh - i) % kExact] = kGap;
    series.exact[_refresh % kExact] = static_cast<float>(number);
    series.last = _refresh;
    if (std::isnan(number))
        return;
    if (series.unit != unit)
        series.unit = shortened(unit, kLongestName);
    if (series.minute != _minute) {
        closeMinute(series);
        series.minute = _minute;
    }
    series.now.add(number);
}

void Trends::closeMinute(Series& series)
{
    if (const auto& now = series.now; now.count() != 0)
        series.minutes.push_back({series.minute, static_cast<float>(now.least()), static_cast<float>(now.mean()),
                                  static_cast<float>(now.greatest())});
    series.now = {};
    if (series.minutes.size() > kMinutes)
        series.minutes.pop_front();
}

void Trends::add(Series& series, std::string_view name)
{
    const Date now = _times[_refresh % kExact];
    const auto become = [&](Date since, std::uint8_t index) {
        if (!series.words.empty() && series.words.back().name == index)
            return;
        series.words.push_back({since, index});
        if (series.words.size() > kMostWords)
            series.words.pop_front();
    };
    // Since the first refresh that did not show it.
    if (series.last != 0 && series.last + 1 < _refresh)
        become(_refresh - series.last < kExact ? _times[(series.last + 1) % kExact] : now, kNoName);
    series.last = _refresh;
    if (name.empty())
        return become(now, kNoName);
    auto text = shortened(name, kLongestName);
    auto known = std::ranges::find(series.names, text);
    if (known == series.names.end() && series.names.size() == kMostNames)
        known = std::prev(series.names.end());
    else if (known == series.names.end())
        known =
            series.names.insert(known, series.names.size() + 1 < kMostNames ? std::move(text) : std::string(kOther));
    become(now, static_cast<std::uint8_t>(known - series.names.begin()));
}

const Trends::Series* Trends::find(std::string_view path) const
{
    const auto found = _series.find(path);
    return found != _series.end() ? &found->second : nullptr;
}

std::vector<std::string_view> Trends::paths() const
{
    std::vector<std::string_view> list;
    for (const auto& each : _series)
        if (!each.second.exact.empty() || !each.second.words.empty())
            list.push_back(each.first);
    return list;
}

std::string Trends::pathOf(const Value& display, std::string_view technology, const std::vector<std::string>& steps)
{
    std::string path;
    const Value* node = &display;
    const Dictionary* beside = nullptr;
    for (const auto& step : steps) {
        std::string name;
        std::map<std::string, int> seen;
        const auto* entry = sectionEntry(technology, path);
        const auto nameRow = [&](const Value& row, std::string_view index) {
            name = Walk::rowStep(row.borrowedDictionary(), index, entry, beside, seen);
            return index == step;
        };
        const Value* found = nullptr;
        if (const auto* list = node->borrowedArray()) {
            for (std::size_t i = 0; i < list->size() && i < kMostLooked && found == nullptr; ++i)
                if (nameRow((*list)[i], std::to_string(i)))
                    found = &(*list)[i];
        } else if (const auto* dictionary = node->borrowedDictionary()) {
            if (Walk::isList(*dictionary)) {
                for (const auto& [key, value] : *dictionary)
                    if (nameRow(value, key)) {
                        found = &value;
                        break;
                    }
            } else {
                found = dictionary->find(step);
                name = nameOf(step, dictionary->contains(kSortedKey));
                beside = dictionary;
            }
        }
        if (found == nullptr)
            return {};
        appendStep(path, name);
        node = found;
    }
    return path;
}

std::vector<Trends::Point> Trends::exact(std::string_view path) const
{
    std::vector<Point> points;
    const auto* series = find(path);
    if (series == nullptr || series->exact.empty())
        return points;
    const Date now = _times[_refresh % kExact];
    const auto count = std::min<std::uint64_t>(_refresh, kExact);
    for (auto refresh = _refresh - count + 1; refresh <= _refresh; ++refresh) {
        const Date time = _times[refresh % kExact];
        if (time <= now && now - time < kExactTime)
            points.push_back({time, refresh <= series->last ? series->exact[refresh % kExact] : kGap});
    }
    // A clock that was set back: what comes first on the axis stands first.
    std::ranges::stable_sort(points, {}, &Point::time);
    return points;
}

std::vector<Trends::Minute> Trends::minutes(std::string_view path) const
{
    std::vector<Minute> list;
    const auto* series = find(path);
    if (series == nullptr || _refresh == 0)
        return list;
    const Date now = _times[_refresh % kExact];
    const auto add = [&](std::uint32_t minute, double least, double mean, double greatest) {
        const Date time = _minuteTimes[minute % kMinutes];
        if (_minute - minute < kMinutes && time <= now && now - time < std::chrono::hours(24))
            list.push_back({time, least, mean, greatest});
    };
    for (const auto& each : series->minutes)
        add(each.minute, each.least, each.mean, each.greatest);
    if (const auto& last = series->now; last.count() != 0)
        add(series->minute, last.least(), last.mean(), last.greatest());
    std::ranges::stable_sort(list, {}, &Minute::time);
    return list;
}

std::vector<Trends::Word> Trends::words(std::string_view path) const
{
    std::vector<Word> list;
    const auto* series = find(path);
    if (series == nullptr)
        return list;
    for (const auto& [since, name] : series->words)
        list.push_back({since, name == kNoName ? std::string() : series->names[name]});
    if (!list.empty() && !list.back().text.empty() && series->last < _refresh)
        list.push_back(
            {_refresh - series->last < kExact ? _times[(series->last + 1) % kExact] : _times[_refresh % kExact], {}});
    return list;
}

std::string_view Trends::unit(std::string_view path) const
{
    const auto* series = find(path);
    return series != nullptr ? std::string_view(series->unit) : std::string_view();
}

std::string Trends::sentence(std::string_view path, Date now) const
{
    const auto name = nameIn(path);
    if (auto strip = words(path); !strip.empty()) {
        std::erase_if(strip, [now](const Word& each) { return each.since > now; });
        if (strip.empty())
            strip.push_back({now, {}});
        const Date begin = std::min(now, _times[_refresh % kExact]) - kExactTime;
        const auto changes = std::ranges::count_if(std::next(strip.begin()), strip.end(),
                                                   [&](const Word& each) { return each.since > begin; });
        const auto last = strip.back().text.empty() ? std::string("no value") : strip.back().text;
        return formatted("%@, %@ now, %ld %s in 15 minutes", name, last, static_cast<long>(changes),
                         changes == 1 ? "change" : "changes");
    }
    auto all = exact(path);
    std::erase_if(all, [now](const Point& each) { return each.time > now; });
    std::vector<double> numbers;
    for (const auto& each : all)
        if (!std::isnan(each.number))
            numbers.push_back(each.number);
    if (numbers.empty())
        return formatted("%@, no value in 15 minutes", name);
    const auto latest =
        std::isnan(all.back().number) ? std::string("no value") : withUnit(shortText(all.back().number), unit(path));
    const auto [least, greatest] = std::ranges::minmax(numbers);
    // The last quarter against the first, in parts of the whole range.
    const auto quarter = std::max<std::ptrdiff_t>(std::ssize(numbers) / 4, 1);
    Spread first, last;
    std::for_each(numbers.begin(), numbers.begin() + quarter, [&](double each) { first.add(each); });
    std::for_each(numbers.end() - quarter, numbers.end(), [&](double each) { last.add(each); });
    const double change = last.mean() - first.mean();
    const char* direction = std::abs(change) <= (greatest - least) / 4 ? "steady" : change > 0 ? "rising" : "falling";
    return formatted("%@, %@ now, %@ to %@ in 15 minutes, %s", name, latest, shortText(least), shortText(greatest),
                     direction);
}

} // namespace kestrum
