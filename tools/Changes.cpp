#include "tools/Changes.h"

namespace kestrum::tools {
namespace {

void appendStep(std::string& pointer, std::string_view step)
{
    pointer += '/';
    if (step.find_first_of("~/") == step.npos) {
        pointer += step;
        return;
    }
    for (const char each : step) {
        if (each == '~')
            pointer += "~0";
        else if (each == '/')
            pointer += "~1";
        else
            pointer += each;
    }
}

} // namespace

void Changes::compare(const Value& now, Value& seen)
{
    const auto dictionary = now.dictionary(), seenDictionary = seen.dictionary();
    const auto array = now.array(), seenArray = seen.array();
    if (dictionary && seenDictionary)
        return compare(*dictionary, *seenDictionary);
    if (array && seenArray)
        return compare(*array, *seenArray);
    const bool isLeaf = !dictionary && !array;
    if (isLeaf && now == seen)
        return;
    if (!isLeaf || seenDictionary || seenArray)
        removed(seen);
    if (dictionary) {
        seen = makeDictionary();
        compare(*dictionary, *seen.dictionary());
    } else if (array) {
        seen = makeArray();
        compare(*array, *seen.array());
    } else {
        seen = now;
        report(now);
    }
}

void Changes::compare(const Dictionary& now, Dictionary& seen)
{
    std::size_t shown = 0;
    for (const auto& [key, value] : now) {
        if (value.isNull() || key == kSortedKey)
            continue;
        ++shown;
        if (!seen.contains(key))
            seen.set(key, Value());
        _path.push_back({&key, 0});
        compare(value, *seen.find(key));
        _path.pop_back();
    }
    if (seen.size() == shown)
        return;
    const auto isGone = [&](const Dictionary::Entry& entry) {
        const Value* held = now.find(entry.key);
        return held == nullptr || held->isNull();
    };
    Dictionary kept;
    for (const auto& entry : seen) {
        if (isGone(entry)) {
            _path.push_back({&entry.key, 0});
            removed(entry.value);
            _path.pop_back();
        } else {
            kept.set(entry.key, entry.value);
        }
    }
    seen = kept;
}

void Changes::compare(const Array& now, Array& seen)
{
    for (std::size_t i = 0; i < now.size(); ++i) {
        if (i == seen.size())
            seen.append(Value());
        _path.push_back({nullptr, i});
        compare(now[i], seen[i]);
        _path.pop_back();
    }
    if (seen.size() == now.size())
        return;
    for (std::size_t i = now.size(); i < seen.size(); ++i) {
        _path.push_back({nullptr, i});
        removed(seen[i]);
        _path.pop_back();
    }
    seen = Array(std::vector<Value>(seen.begin(), seen.begin() + static_cast<std::ptrdiff_t>(now.size())));
}

void Changes::removed(const Value& seen)
{
    if (const auto dictionary = seen.dictionary())
        compare(Dictionary(), *dictionary);
    else if (const auto array = seen.array())
        compare(Array(), *array);
    else if (!seen.isNull())
        report({});
}

void Changes::report(const Value& value)
{
    _pointer.clear();
    for (const auto& [key, index] : _path)
        appendStep(_pointer, key != nullptr ? std::string_view(*key) : std::string_view(std::to_string(index)));
    _onChange(_pointer, value);
}

} // namespace kestrum::tools
