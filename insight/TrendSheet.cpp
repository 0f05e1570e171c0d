#include "insight/TrendSheet.h"

#include "insight/Explanation.h"
#include "insight/History.h"
#include "insight/ListTable.h"
#include "insight/LocalTime.h"
#include "insight/NumberIn.h"
#include "platform/Clock.h"
#include "support/Format.h"

#include <algorithm>
#include <chrono>
#include <cmath>
#include <limits>
#include <numeric>
#include <ranges>
#include <tuple>
#include <utility>

namespace kestrum {
namespace {

using namespace std::chrono_literals;

struct Range {
    const char* name;
    std::chrono::minutes time;
    std::string_view pattern; ///< of the times under the axis
};
constexpr Range kRanges[] = {{"15 min", 15min, "HH:mm:ss"}, {"1 h", 1h, "HH:mm"}, {"1 day", 24h, "HH:mm"}};

constexpr double kNone = std::numeric_limits<double>::quiet_NaN();
constexpr const char* kNoValue = "no value";
constexpr std::chrono::seconds kMinuteGap{90}; // minutes are consecutive below it

/// "Measured RSRP (Physical Cell ID 232)" of ".../Physical Cell ID=232/Measured RSRP".
std::string titleOf(std::string_view key, std::string_view path)
{
    std::string identity;
    for (const auto part : std::views::split(path, '/')) {
        const std::string_view step(part.begin(), part.end());
        if (step.find('=') != step.npos)
            identity = step;
    }
    for (std::size_t at = 0; (at = identity.find_first_of("=,", at)) != identity.npos; ++at)
        identity.replace(at, 1, identity[at] == '=' ? " " : ", ");
    return identity.empty() ? std::string(key) : formatted("%@ (%@)", key, identity);
}

/// The next of 1, 2, 5, 10, 20, ... that is at least the number.
double roundStep(double number)
{
    const double power = std::pow(10, std::floor(std::log10(number)));
    for (const double step : {1.0, 2.0, 5.0})
        if (step * power >= number)
            return step * power;
    return 10 * power;
}

/// A scale around numbers whose key has none.
Scale scaleAround(double least, double greatest)
{
    const double step =
        greatest > least ? roundStep((greatest - least) / 4) : roundStep(std::max(std::abs(least), 1.0));
    const Scale scale{std::floor(least / step) * step, std::ceil(greatest / step) * step};
    return scale.least < scale.greatest ? scale : Scale{scale.least - step, scale.greatest + step};
}

} // namespace

TrendSheet::TrendSheet(const Shown& shown, const RowOfPane& row, const History& history, const Thresholds& thresholds,
                       const Clock& clock)
    : _history(history), _thresholds(thresholds), _clock(clock)
{
    _contents.hint = "There is nothing to draw: no refresh has had a value here yet.";
    const auto pane = PathDictionary(std::string(kRootPath), shown.root).find(row.path);
    const auto* rows = pane ? pane->childNodes() : nullptr;
    if (rows == nullptr || row.row >= rows->size())
        return;
    const auto& key = (*rows)[row.row]->displayName();
    _entry = keyEntryAt(shown.technology, joinPath(row.path, key));
    if (const auto* technology = leafText(*pane, kTechnologyKey))
        _technology = *technology;
    if (shown.moment) {
        const auto display = shown.moment->display();
        _path = Trends::pathOf(display, shown.technology, stepsToRow(display, row.path, row.row));
    }
    _contents.title = titleOf(key, _path);
    update(shown);
}

bool TrendSheet::update(const Shown& shown)
{
    if (shown.moment)
        _end = shown.moment->time;
    fill();
    return true;
}

void TrendSheet::cursorMoved(std::optional<std::size_t> to)
{
    _cursor = to && *to < _times.size() ? std::optional(_times[*to]) : std::nullopt;
    fill();
}

void TrendSheet::rangeChosen(std::size_t range)
{
    if (range >= std::size(kRanges))
        return;
    _range = range;
    fill();
}

void TrendSheet::fill()
{
    _contents.parts.clear();
    _times.clear();
    const auto& trends = _history.trends();
    if (!_end)
        return;
    SheetPart part;
    auto& plot = part.plot.emplace();
    if (!trends.words(_path).empty())
        fillWords(part);
    else if (!trends.exact(_path).empty() || !trends.minutes(_path).empty())
        fillNumbers(part);
    else
        return;
    markCellChanges(plot);
    fillTimes(plot);
    for (const auto& each : kRanges)
        plot.ranges.emplace_back(each.name);
    plot.range = _range;
    plot.cursor = cursorIndex();
    plot.sentence = trends.sentence(_path, *_end);
    _contents.parts.push_back(std::move(part));
}

Date TrendSheet::begin() const
{
    return *_end - kRanges[_range].time;
}

double TrendSheet::placeOf(Date time) const
{
    const auto whole = std::chrono::duration<double>(kRanges[_range].time);
    return std::clamp(std::chrono::duration<double>(time - begin()) / whole, 0.0, 1.0);
}

/// In the unit of the key's scale where there is one.
std::optional<double> TrendSheet::shownNumber(double number) const
{
    return _entry != nullptr ? numberOf(*_entry, number, _history.trends().unit(_path)) : std::nullopt;
}

std::vector<TrendSheet::Sample> TrendSheet::samples() const
{
    std::vector<Sample> found;
    const auto gap = _range == 0 ? EventFinder::kSilence : kMinuteGap;
    const auto add = [&](Date time, double least, double mean, double greatest) {
        if (time < begin() || time > *_end)
            return;
        if (!found.empty() && time - found.back().time > gap)
            found.push_back({found.back().time + (time - found.back().time) / 2, kNone, kNone, kNone});
        const auto shown = [this](double number) { return shownNumber(number).value_or(number); };
        found.push_back({time, shown(least), shown(mean), shown(greatest)});
    };
    if (_range == 0)
        for (const auto& each : _history.trends().exact(_path))
            add(each.time, each.number, each.number, each.number);
    else
        for (const auto& each : _history.trends().minutes(_path))
            add(each.time, each.least, each.mean, each.greatest);
    if (found.size() > kMostPoints)
        found.erase(found.begin(), found.end() - kMostPoints);
    return found;
}

SheetCell TrendSheet::cellOf(double number) const
{
    if (std::isnan(number))
        return {kNoValue};
    return gradedCell(_entry, withUnit(shortText(number), _unit), _thresholds, _technology ? &*_technology : nullptr);
}

void TrendSheet::fillNumbers(SheetPart& part)
{
    _unit = _history.trends().unit(_path);
    if (_unit.empty() && shownNumber(0))
        _unit = _entry->in.unit;
    const auto all = samples();
    Spread spread, means;
    auto& plot = *part.plot;
    for (const auto& each : all) {
        _times.push_back(each.time);
        plot.points.push_back({placeOf(each.time), each.least, each.mean, each.greatest});
        if (std::isnan(each.mean))
            continue;
        spread.add(each.least);
        spread.add(each.greatest);
        means.add(each.mean);
    }
    double now = kNone;
    for (const auto& each : _history.trends().exact(_path))
        if (each.time <= *_end)
            now = shownNumber(each.number).value_or(each.number);
    part.facts = {{"Now", cellOf(now)}};
    if (means.count() != 0)
        part.facts.insert(part.facts.end(), {{"Least", cellOf(spread.least())},
                                             {"Mean", cellOf(means.mean())},
                                             {"Greatest", cellOf(spread.greatest())}});
    fillAxis(plot, all);
    if (!all.empty())
        plot.reading = readingOf(all[cursorIndex().value_or(all.size() - 1)]);
}

void TrendSheet::fillAxis(SheetPlot& plot, const std::vector<Sample>& samples) const
{
    Spread spread;
    for (const auto& each : samples)
        if (!std::isnan(each.mean)) {
            spread.add(each.least);
            spread.add(each.greatest);
        }
    const bool isKnown = shownNumber(0).has_value();
    if (isKnown && _entry->in.scale)
        std::tie(plot.bottom, plot.top) = std::pair(_entry->in.scale->least, _entry->in.scale->greatest);
    else if (spread.count() != 0) {
        const auto scale = scaleAround(spread.least(), spread.greatest());
        std::tie(plot.bottom, plot.top) = std::pair(scale.least, scale.greatest);
    }
    for (const double number : {plot.bottom, std::midpoint(plot.bottom, plot.top), plot.top})
        plot.numbers.push_back(withUnit(shortText(number), _unit));
    if (isKnown)
        fillBands(plot);
}

/// Those that the axis reaches.
void TrendSheet::fillBands(SheetPlot& plot) const
{
    Dictionary beside;
    if (_technology)
        beside.setText(kTechnologyKey, *_technology);
    for (const auto& [least, grade] : bandsOf(*_entry, &beside, _thresholds)) {
        if (least >= plot.top)
            break;
        if (least <= plot.bottom)
            plot.bands.clear();
        plot.bands.push_back({std::max(least, plot.bottom), std::string(word(grade))});
    }
}

void TrendSheet::fillWords(SheetPart& part)
{
    auto& plot = *part.plot;
    const bool isIdentity = _entry != nullptr && _entry->kind == Kind::Identity;
    const auto words = _history.trends().words(_path);
    const auto today = dayText(_clock, *_end);
    // From the newest back: when the clock was set back, the later words count.
    Date to = *_end;
    for (const auto& [since, text] : words | std::views::reverse) {
        if (since > *_end)
            continue;
        const auto from = std::max(std::min(since, to), begin());
        if (part.facts.empty())
            part.facts = {{"Now", {text.empty() ? kNoValue : text}}, {"Since", {momentText(_clock, since, today)}}};
        if (!text.empty() && from < to) {
            plot.spans.push_back({placeOf(from), placeOf(to), text});
            _times.push_back(from);
            if (isIdentity && from > begin() && &text != &words.front().text)
                plot.marks.push_back({placeOf(from), text});
        }
        to = std::min(to, from);
        if (to <= begin())
            break;
    }
    if (part.facts.empty())
        part.facts = {{"Now", {kNoValue}}};
    std::ranges::reverse(plot.spans);
    std::ranges::reverse(plot.marks);
    std::ranges::reverse(_times);
    const auto at = cursorIndex();
    plot.reading = at ? formatted("%@  %@", timeText(_times[*at]), plot.spans[*at].text)
                      : formatted("%@  %@", timeText(*_end), part.facts.front().value.text);
}

void TrendSheet::markCellChanges(SheetPlot& plot) const
{
    for (const Date each : _history.cellChanges())
        if (each > begin() && each <= *_end)
            plot.marks.push_back({placeOf(each), {}});
    std::ranges::stable_sort(plot.marks, {}, &SheetPlot::Mark::at);
}

std::string TrendSheet::timeText(Date time) const
{
    return _clock.localText(time, kRanges[_range].pattern);
}

void TrendSheet::fillTimes(SheetPlot& plot) const
{
    for (const Date time : {begin(), begin() + (*_end - begin()) / 2, *_end})
        plot.times.push_back(timeText(time));
}

/// The last point that is not behind the cursor's moment: it stays there while newer points come.
std::optional<std::size_t> TrendSheet::cursorIndex() const
{
    if (!_cursor || _times.empty())
        return std::nullopt;
    const auto behind = std::ranges::upper_bound(_times, *_cursor);
    return behind == _times.begin() ? 0 : static_cast<std::size_t>(behind - _times.begin() - 1);
}

/// "13:05:44  -98.25 dBm, fair", or "13:05  -101 to -95, mean -98.25 dBm, fair" of a minute.
std::string TrendSheet::readingOf(const Sample& sample) const
{
    const auto cell = cellOf(sample.mean);
    const auto value = sample.least < sample.greatest ? formatted("%@ to %@, mean %@", shortText(sample.least),
                                                                  shortText(sample.greatest), cell.text)
                                                      : cell.text;
    const auto reading = formatted("%@  %@", timeText(sample.time), value);
    return cell.word.empty() ? reading : formatted("%@, %@", reading, cell.word);
}

} // namespace kestrum
