#include "core/KestrumModelNode.h"

#include "LogGenerator/ArrayLock.h"
#include "support/Format.h"

#include <algorithm>
#include <cstddef>
#include <ranges>
#include <string>
#include <tuple>
#include <utility>

namespace kestrum {
namespace {

constexpr std::string_view kTitle = "Kestrum";
constexpr char kOrderSeparator = ';';

/// The parts of a key before and after the first ";".
std::pair<std::string_view, std::string_view> splitAtOrder(std::string_view key)
{
    const auto end = std::min(key.find(kOrderSeparator), key.size());
    return {key.substr(0, end), key.substr(std::min(end + 1, key.size()))};
}

/// "3;Neighbor" is shown as "Neighbor". A key with several ";" is shown whole.
std::string_view nameInSortedMode(std::string_view key)
{
    return std::ranges::count(key, kOrderSeparator) == 1 ? splitAtOrder(key).second : key;
}

/// The entries to show, in display order.
std::vector<const Dictionary::Entry*> shownEntries(const Dictionary& dictionary, bool sorted)
{
    std::vector<const Dictionary::Entry*> entries;
    entries.reserve(dictionary.size());
    for (const auto& entry : dictionary)
        if (entry.key != kSortedKey && entry.value)
            entries.push_back(&entry);
    // Part by part, because ";" sorts after the digits: "10;" would come before "1;". Kept: parts are compared as
    // texts, "10" before "2"; field displays show this order. "1" and "1;" have equal parts.
    if (sorted)
        std::ranges::sort(entries, {}, [](const auto* entry) {
            const auto [first, second] = splitAtOrder(entry->key);
            return std::tuple(first, second, std::string_view(entry->key));
        });
    return entries;
}

KestrumModelNodeRef makeNode(std::string name, const Value& object);

bool isSorted(const Dictionary& dictionary)
{
    const Value* marker = dictionary.find(kSortedKey);
    return marker != nullptr && !marker->isNull();
}

KestrumModelNodes childrenOf(const Dictionary& dictionary)
{
    const bool sorted = isSorted(dictionary);
    const auto entries = shownEntries(dictionary, sorted);
    KestrumModelNodes children;
    children.reserve(entries.size());
    for (const auto* entry : entries)
        children.push_back(makeNode(std::string(sorted ? nameInSortedMode(entry->key) : entry->key), entry->value));
    return children;
}

KestrumModelNodes childrenOf(const Array& array)
{
    const ArrayLocked locked; // for the whole walk: no section may rewrite the array meanwhile
    KestrumModelNodes children;
    children.reserve(array.size());
    for (const auto& element : array)
        children.push_back(makeNode(std::to_string(children.size()), element));
    return children;
}

KestrumModelNodeRef makeNode(std::string name, const Value& object)
{
    if (auto text = object.text())
        return std::make_shared<KestrumModelLeafNode>(std::move(name), *std::move(text));
    if (const auto dictionary = object.dictionary())
        return std::make_shared<KestrumModelTreeNode>(std::move(name), childrenOf(*dictionary));
    if (const auto array = object.array())
        return std::make_shared<KestrumModelTreeNode>(std::move(name), childrenOf(*array));
    return std::make_shared<KestrumModelLeafNode>(std::move(name), "(unknown)");
}

/// A name as it stands in a path.
std::string_view componentOf(std::string_view name)
{
    const auto first = std::min(name.find_first_not_of('/'), name.size());
    const auto component = name.substr(first, name.find_last_not_of('/') + 1 - first);
    return component.empty() ? "(empty)" : component;
}

/// The node below `parent` at the rest of a path. Several children may match: a name may hold a "/".
KestrumModelNodeRef nodeBelow(const KestrumModelNode& parent, std::string_view rest)
{
    if (parent.childNodes() == nullptr)
        return nullptr;
    for (const auto& child : *parent.childNodes() | std::views::reverse) {
        const auto component = componentOf(child->displayName());
        if (rest == component)
            return child;
        if (rest.size() > component.size() && rest[component.size()] == '/' && rest.starts_with(component))
            if (auto found = nodeBelow(*child, rest.substr(component.size() + 1)))
                return found;
    }
    return nullptr;
}

/// A step from a container, and the name of the row there.
struct Step {
    std::string key, name;
    const Value* value;
};

/// As `makeNode` names and orders the rows.
std::vector<Step> stepsFrom(const Value& object)
{
    std::vector<Step> steps;
    if (const auto* dictionary = object.borrowedDictionary()) {
        const bool sorted = isSorted(*dictionary);
        for (const auto* entry : shownEntries(*dictionary, sorted))
            steps.push_back(
                {entry->key, std::string(sorted ? nameInSortedMode(entry->key) : entry->key), &entry->value});
    } else if (const auto* array = object.borrowedArray()) {
        for (const auto& element : *array)
            steps.push_back({std::to_string(steps.size()), std::to_string(steps.size()), &element});
    }
    return steps;
}

/// As `nodeBelow`; `found` has the steps so far.
const Value* valueBelow(const Value& parent, std::string_view rest, std::vector<std::string>& found)
{
    for (auto& [key, name, value] : stepsFrom(parent) | std::views::reverse) {
        const auto component = componentOf(name);
        const bool isWhole = rest == component;
        if (!isWhole && (!rest.starts_with(component) || rest[component.size()] != '/'))
            continue;
        found.push_back(key);
        const Value* below = isWhole ? value : valueBelow(*value, rest.substr(component.size() + 1), found);
        if (below != nullptr)
            return below;
        found.pop_back();
    }
    return nullptr;
}

/// A path and the "/" that ends it.
std::string withSlash(std::string_view path)
{
    std::string ended(path);
    if (!ended.ends_with('/'))
        ended += '/';
    return ended;
}

} // namespace

std::string joinPath(std::string_view path, std::string_view name)
{
    return withSlash(path).append(componentOf(name));
}

KestrumModelNodeRef PathDictionary::find(std::string_view path) const
{
    if (!_node || path == _path)
        return _node;
    const auto start = withSlash(_path);
    return path.starts_with(start) ? nodeBelow(*_node, path.substr(start.size())) : nullptr;
}

std::vector<std::string> stepsToRow(const Value& object, std::string_view path, std::size_t row)
{
    const ArrayLocked locked;
    std::vector<std::string> steps;
    const Value* node = path == kRootPath ? &object : valueBelow(object, path.substr(kRootPath.size()), steps);
    const auto rows = node != nullptr ? stepsFrom(*node) : std::vector<Step>();
    if (row >= rows.size())
        return {};
    steps.push_back(rows[row].key);
    return steps;
}

KestrumModelNodeRef buildNode(std::string name, const Value& object, PathDictionary& pathDictionary, std::string path)
{
    auto node = makeNode(std::move(name), object);
    pathDictionary = PathDictionary(std::move(path), node);
    return node;
}

KestrumModelNodeRef KestrumModelNode::makeTreeFromObject(const Value& object, PathDictionary& withPathDictionary)
{
    return buildNode(std::string(kTitle), object, withPathDictionary, std::string(kRootPath));
}

} // namespace kestrum
