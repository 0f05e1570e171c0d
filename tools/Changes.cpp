#include "tools/Changes.h"

#include <algorithm>
#include <array>
#include <map>
#include <utility>

namespace kestrum::tools {
namespace {

constexpr std::size_t kMostSpares = 4096;

std::string stepTo(std::string_view key)
{
    std::string step = "/";
    for (const char each : key) {
        if (each == '~')
            step += "~0";
        else if (each == '/')
            step += "~1";
        else
            step += each;
    }
    return step;
}

constexpr auto kIsPlain = [] {
    std::array<bool, 256> isPlain{};
    for (std::size_t c = 0x20; c < 0x7F; ++c)
        isPlain[c] = c != '"' && c != ',' && c != '\\';
    return isPlain;
}();

const void* addressOf(const Value& node)
{
    const void* dictionary = node.borrowedDictionary();
    return dictionary != nullptr ? dictionary : node.borrowedArray();
}

} // namespace

bool Changes::isPlain(std::string_view text)
{
    return std::ranges::all_of(text, [](char c) { return kIsPlain[static_cast<unsigned char>(c)]; });
}

void Changes::look(const Value& display)
{
    if (addressOf(display) != addressOf(_display)) {
        _display = display;
        _parts.clear();
    }
    compare(display, *_seen);
    dropSpares();
}

void Changes::look(const Value& display, LogCode code, const NodesOf& nodesOf)
{
    if (addressOf(display) == addressOf(_display))
        if (const auto known = _parts.find(code); known != _parts.end() && lookAt(known->second))
            return;
    look(display);
    auto& parts = _parts[code];
    parts.clear();
    findParts(nodesOf(code).value_or(std::vector<Value>{display}), _seen, parts);
}

// False when one of them has vanished.
bool Changes::lookAt(const std::vector<Part>& parts)
{
    for (const auto& [around, place, node] : parts) {
        const auto seen = place.lock();
        const auto* dictionary = node.dictionary();
        const auto* array = node.array();
        if (!seen || (dictionary == nullptr && array == nullptr))
            return false;
        _path = around;
        if (dictionary != nullptr)
            compare(*dictionary, *seen);
        else
            compare(*array, *seen);
    }
    _path = {};
    dropSpares();
    return true;
}

// In the order of the display.
void Changes::findParts(std::span<const Value> nodes, const std::shared_ptr<Seen>& below, std::vector<Part>& found)
{
    if (below->form == Seen::Form::Leaf)
        return;
    const auto node = std::ranges::find(nodes, below->node, addressOf);
    if (node != nodes.end()) {
        found.push_back({_path, below, SectionRef(*node)});
        return;
    }
    const Step step(_path, *below);
    for (const auto& child : below->children)
        findParts(nodes, child, found);
}

void Changes::compare(const Value& now, Seen& seen)
{
    if (const auto* reading = now.borrowedReading()) {
        const auto* before = seen.leaf.borrowedReading();
        if (before == nullptr || *before != *reading)
            compareText(now, reading->text(), seen);
    } else if (const auto* text = now.borrowedString()) {
        compareText(now, *text, seen);
    } else if (const auto* dictionary = now.borrowedDictionary()) {
        become(Seen::Form::Dictionary, seen);
        compare(*dictionary, seen);
    } else if (const auto* array = now.borrowedArray()) {
        become(Seen::Form::Array, seen);
        compare(*array, seen);
    } else if (seen.form != Seen::Form::Leaf || seen.leaf != now) {
        become(Seen::Form::Leaf, seen);
        seen.leaf = now;
        report(seen, now);
    }
}

void Changes::compareText(const Value& now, std::string_view text, Seen& seen)
{
    const bool isSame = seen.leaf.isText() && seen.text == text;
    if (!isSame)
        become(Seen::Form::Leaf, seen);
    if (const auto* reading = now.borrowedReading())
        seen.leaf.assign(*reading);
    else
        seen.leaf.assignText({});
    if (isSame)
        return;
    seen.text = text;
    report(seen, now, text);
}

void Changes::compare(const Dictionary& now, Seen& seen)
{
    const Step step(_path, seen);
    seen.node = &now;
    auto& children = seen.children;
    std::size_t count = 0, next = 0;
    std::map<std::string_view, std::size_t> places; // used when keys come in another order than before
    for (const auto& [key, value] : now) {
        if (value.isNull() || key == kSortedKey)
            continue;
        ++count;
        if (next == children.size() || children[next]->key != key) {
            if (next < seen.shown || !places.empty())
                for (auto at = places.size(); at < seen.shown; ++at)
                    places.emplace(children[at]->key, at);
            const auto known = places.find(key);
            next = known == places.end() ? seen.shown : known->second;
            if (known == places.end()) {
                children.resize(seen.shown); // a spare may have this key
                children.push_back(makeSeen(key));
            }
        }
        seen.shown = std::max(seen.shown, next + 1);
        compare(value, *children[next++]);
    }
    if (count == 0) {
        removeFrom(0, seen);
    } else if (count < seen.shown) {
        children.resize(seen.shown);
        std::erase_if(children, [&](const auto& child) {
            const Value* held = now.find(child->key);
            const bool isGone = held == nullptr || held->isNull();
            if (isGone)
                remove(*child);
            return isGone;
        });
        seen.shown = count;
    }
}

void Changes::compare(const Array& now, Seen& seen)
{
    const Step step(_path, seen);
    seen.node = &now;
    for (std::size_t i = 0; i < now.size(); ++i) {
        if (i == seen.children.size())
            seen.children.push_back(makeSeen(std::to_string(i)));
        seen.shown = std::max(seen.shown, i + 1);
        compare(now[i], *seen.children[i]);
    }
    removeFrom(now.size(), seen);
}

/// Makes children spares.
void Changes::removeFrom(std::size_t first, Seen& seen)
{
    for (auto i = first; i < seen.shown; ++i)
        remove(*seen.children[i]);
    _spares += seen.shown - first;
    seen.shown = first;
}

/// Called after each look, so that memory does not grow with the captures' length.
void Changes::dropSpares()
{
    if (_spares <= kMostSpares)
        return;
    dropSparesOf(*_seen);
    _spares = 0;
}

void Changes::dropSparesOf(Seen& seen)
{
    seen.children.resize(seen.shown);
    for (const auto& child : seen.children)
        dropSparesOf(*child);
}

std::shared_ptr<Changes::Seen> Changes::makeSeen(std::string_view key)
{
    auto seen = std::make_shared<Seen>();
    seen->key = key;
    seen->step = stepTo(key);
    seen->isPlain = isPlain(seen->step);
    return seen;
}

/// Removes what was there in another form; a leaf's next value replaces it.
void Changes::become(Seen::Form form, Seen& seen)
{
    if (seen.form == form)
        return;
    remove(seen);
    seen.children.clear();
    seen.form = form;
}

void Changes::remove(Seen& seen)
{
    if (seen.form == Seen::Form::Dictionary)
        compare(Dictionary(), seen);
    else if (seen.form == Seen::Form::Array)
        compare(Array(), seen);
    else if (!seen.leaf.isNull())
        report(seen, {});
    seen.leaf = {};
}

void Changes::report(const Seen& seen, const Value& value, std::string_view text)
{
    const Step step(_path, seen);
    _onChange({_path.text, value, text, _path.isPlain});
}

} // namespace kestrum::tools
