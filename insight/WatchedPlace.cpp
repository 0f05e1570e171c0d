#include "insight/WatchedPlace.h"

#include "support/Utf8.h"

#include <algorithm>
#include <charconv>
#include <utility>

namespace kestrum {
namespace {

constexpr char kBetween = '/', kOrderSeparator = ';';

/// The value with the name; its key may have an order before it, "0;Serving Cell".
const Value* namedIn(const Dictionary& dictionary, std::string_view name)
{
    if (const Value* found = dictionary.find(name))
        return found;
    for (const auto& [key, value] : dictionary)
        if (key.size() > name.size() && key.ends_with(name) &&
            key.find(kOrderSeparator) == key.size() - name.size() - 1)
            return &value;
    return nullptr;
}

const void* addressOf(const Value& node)
{
    const void* dictionary = node.borrowedDictionary();
    return dictionary != nullptr ? dictionary : node.borrowedArray();
}

} // namespace

std::string shortened(std::string_view text, std::size_t most)
{
    if (text.size() <= most)
        return std::string(text);
    return std::string(beginOf(text, most)) + "…";
}

WatchedPlace::WatchedPlace(const Place& place) : _code(place.code)
{
    const auto split = [](std::string_view path) {
        const auto at = path.rfind(kBetween);
        return std::pair(path.substr(0, at), path.substr(at + 1));
    };
    std::tie(_around, _key) = split(place.path);
    const auto [list, row] = split(_around);
    std::size_t index = 0;
    const auto* end = row.data() + row.size();
    if (row == "*")
        _hasAllRows = true;
    else if (std::from_chars(row.data(), end, index).ptr == end) // not "1x"
        _row = index;
    if (_hasAllRows || _row)
        _around = list;
}

void WatchedPlace::findIn(const Value& display)
{
    const Value* node = &display;
    for (auto rest = _around; node != nullptr && !rest.empty();) {
        const auto end = std::min(rest.find(kBetween), rest.size());
        const auto* dictionary = node->borrowedDictionary();
        node = dictionary != nullptr ? namedIn(*dictionary, rest.substr(0, end)) : nullptr;
        rest.remove_prefix(std::min(end + 1, rest.size()));
    }
    _node = node != nullptr ? SectionRef(*node) : SectionRef();
    _address = node != nullptr ? addressOf(*node) : nullptr;
}

bool WatchedPlace::isReachedBy(LogCode code, const std::optional<std::vector<Value>>& nodes) const
{
    if (_code != 0 || !nodes)
        return _code == 0 || _code == code;
    return _address != nullptr && std::ranges::find(*nodes, _address, addressOf) != nodes->end();
}

const Value* WatchedPlace::search() const
{
    const Dictionary* row = _node.dictionary();
    if (_row) {
        const Array* list = _node.array();
        row = list != nullptr && *_row < list->size() ? (*list)[*_row].borrowedDictionary() : nullptr;
    }
    const Value* found = row != nullptr ? namedIn(*row, _key) : nullptr;
    if (found != nullptr && !_row) {
        const auto entry = std::ranges::find(*row, found, [](const auto& each) { return &each.value; });
        _at = static_cast<std::size_t>(entry - row->begin());
        _found = entry->key;
    }
    return found;
}

// The rows' values one after the other, cut: a list may be long.
std::string WatchedPlace::textNow() const
{
    std::string all;
    if (const Array* list = _node.array())
        for (const Value& row : *list) {
            const auto* dictionary = row.borrowedDictionary();
            const Value* held = dictionary != nullptr ? namedIn(*dictionary, _key) : nullptr;
            if (held == nullptr || !held->isText())
                continue;
            all += all.empty() ? "" : ", ";
            all += shortened(*held->text(), kLongestText);
            if (all.size() > kLongestText)
                break;
        }
    return all.empty() ? "none" : shortened(all, kLongestText);
}

WatchedPlace::Seen WatchedPlace::look()
{
    std::string text;
    if (_hasAllRows) {
        if (_node.array() == nullptr)
            return Seen::Same;
        text = textNow();
    } else {
        const Value* now = value();
        if (now == nullptr)
            return Seen::Same;
        if (const auto* reading = now->borrowedReading()) {
            if (_reading == *reading)
                return Seen::Same;
            _reading = *reading;
            text = shortened(reading->text(), kLongestText);
        } else if (const auto* words = now->borrowedString()) {
            _reading.reset();
            text = shortened(*words, kLongestText);
        }
    }
    if (text.empty() || text == _text)
        return Seen::Same;
    const bool wasKnown = !_text.empty();
    _text = std::move(text);
    return wasKnown ? Seen::Changed : Seen::Known;
}

} // namespace kestrum
