#include "core/KestrumModelNode.h"

#include "LogGenerator/ArrayLock.h"
#include "support/Format.h"

#include <algorithm>
#include <cstddef>
#include <optional>
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

/// The limit of all paths of a tree, in bytes. Real displays need a thousandth of it, but nested long names would need
/// thousands of times the size of their message. Nodes beyond the limit are in the tree without a path.
constexpr std::size_t kPathBytes = std::size_t{64} << 20;

/// Builds one tree. A node gets no path when earlier paths have reached the limit.
class Builder {
public:
    using Path = std::optional<std::string>;

    explicit Builder(PathDictionary& paths) : _paths(paths) {}

    KestrumModelNodeRef build(std::string name, const Value& object, const Path& path)
    {
        auto node = make(std::move(name), object, path);
        if (path)
            _paths.insert_or_assign(*path, node);
        return node;
    }

private:
    KestrumModelNodeRef make(std::string name, const Value& object, const Path& path)
    {
        if (auto text = object.text())
            return std::make_shared<KestrumModelLeafNode>(std::move(name), *std::move(text));
        if (const auto dictionary = object.dictionary())
            return std::make_shared<KestrumModelTreeNode>(std::move(name), childrenOf(*dictionary, path));
        if (const auto array = object.array())
            return std::make_shared<KestrumModelTreeNode>(std::move(name), childrenOf(*array, path));
        return std::make_shared<KestrumModelLeafNode>(std::move(name), "(unknown)");
    }

    KestrumModelNodes childrenOf(const Dictionary& dictionary, const Path& path)
    {
        const Value* marker = dictionary.find(kSortedKey);
        const bool sorted = marker != nullptr && !marker->isNull();
        const auto entries = shownEntries(dictionary, sorted);
        KestrumModelNodes children;
        children.reserve(entries.size());
        for (const auto* entry : entries)
            children.push_back(
                child(std::string(sorted ? nameInSortedMode(entry->key) : entry->key), entry->value, path));
        return children;
    }

    KestrumModelNodes childrenOf(const Array& array, const Path& path)
    {
        const ArrayLocked locked; // for the whole walk: no section may rewrite the array meanwhile
        KestrumModelNodes children;
        children.reserve(array.size());
        for (const auto& element : array)
            children.push_back(child(std::to_string(children.size()), element, path));
        return children;
    }

    KestrumModelNodeRef child(std::string name, const Value& object, const Path& parent)
    {
        Path path;
        if (parent && parent->size() + name.size() < _left) {
            path = joinPath(*parent, name);
            _left -= std::min(_left, path->size());
        }
        return build(std::move(name), object, path);
    }

    PathDictionary& _paths;
    std::size_t _left = kPathBytes;
};

} // namespace

std::string joinPath(std::string_view path, std::string_view name)
{
    const auto first = std::min(name.find_first_not_of('/'), name.size());
    const auto component = name.substr(first, name.find_last_not_of('/') + 1 - first);
    std::string joined(path);
    if (!joined.ends_with('/'))
        joined += '/';
    return joined += component.empty() ? "(empty)" : component;
}

KestrumModelNodeRef buildNode(std::string name, const Value& object, PathDictionary& pathDictionary,
                              const std::string& path)
{
    return Builder(pathDictionary).build(std::move(name), object, path);
}

KestrumModelNodeRef KestrumModelNode::makeTreeFromObject(const Value& object, PathDictionary& withPathDictionary)
{
    return buildNode(std::string(kTitle), object, withPathDictionary, std::string(kRootPath));
}

} // namespace kestrum
