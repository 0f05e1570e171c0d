// Properties of every display, whatever its contents.
#include "core/KestrumModelNode.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <map>
#include <string>

namespace kestrum {
namespace {

/// Few letters, so that names are often equal, or prefixes of each other.
rc::Gen<std::string> names()
{
    return rc::gen::container<std::string>(rc::gen::element('a', 'b', '1', ';', '/'));
}

rc::Gen<Value> values(int depth)
{
    auto text = rc::gen::map(names(), [](std::string each) { return Value(std::move(each)); });
    auto other = rc::gen::element(Value(), Value(7), Value(true), Value(2.5));
    if (depth == 0)
        return rc::gen::oneOf(text, other);
    auto array = rc::gen::map(rc::gen::container<std::vector<Value>>(values(depth - 1)),
                              [](std::vector<Value> elements) { return Value(makeArray(std::move(elements))); });
    using Entries = std::vector<std::pair<std::string, Value>>;
    auto keys = rc::gen::oneOf(names(), rc::gen::just(std::string("_sorted")));
    auto dictionary =
        rc::gen::map(rc::gen::container<Entries>(rc::gen::pair(keys, values(depth - 1))), [](Entries entries) {
            auto made = makeDictionary();
            for (auto& [key, value] : entries)
                made->set(key, std::move(value));
            return Value(made);
        });
    return rc::gen::oneOf(text, other, array, dictionary);
}

rc::Gen<Value> displays()
{
    return rc::gen::resize(6, values(3));
}

using Nodes = std::map<std::string, KestrumModelNodeRef>;

/// Of nodes with the same path the last one built: children come before their parent.
void collect(const KestrumModelNodeRef& node, const std::string& path, Nodes& nodes)
{
    RC_ASSERT((node->value() == nullptr) != (node->childNodes() == nullptr));
    if (node->childNodes() != nullptr)
        for (const auto& child : *node->childNodes())
            collect(child, joinPath(path, child->displayName()), nodes);
    nodes[path] = node;
}

RC_GTEST_PROP(AnyDisplay, IsFoundNodeByNodeUnderItsPaths, ())
{
    PathDictionary dictionary;
    const auto root = KestrumModelNode::makeTreeFromObject(*displays(), dictionary);
    Nodes nodes;
    collect(root, "/", nodes);
    for (const auto& [path, node] : nodes)
        RC_ASSERT(dictionary.find(path) == node);
    const auto other = joinPath("/", *names());
    RC_ASSERT((dictionary.find(other) != nullptr) == nodes.contains(other));
}

RC_GTEST_PROP(AnyDisplay, GivesTheSameTreeTwice, ())
{
    const Value display = *displays();
    const Value before = deepCopy(display);
    PathDictionary dictionary;
    Nodes first, second;
    collect(KestrumModelNode::makeTreeFromObject(display, dictionary), "/", first);
    collect(KestrumModelNode::makeTreeFromObject(display, dictionary), "/", second);
    RC_ASSERT(display == before);
    RC_ASSERT(first.size() == second.size());
    for (const auto& [path, node] : first) {
        const auto& other = second.at(path);
        RC_ASSERT(node->displayName() == other->displayName());
        RC_ASSERT((node->value() == nullptr) == (other->value() == nullptr));
        RC_ASSERT((node->value() == nullptr || *node->value() == *other->value()));
    }
}

RC_GTEST_PROP(AnyName, JoinsWithExactlyOneSlash, ())
{
    const std::string parent = joinPath("/", *names());
    const std::string joined = joinPath(parent, *names());
    RC_ASSERT(joined.starts_with(parent + "/"));
    const std::string component = joined.substr(parent.size() + 1);
    RC_ASSERT(!component.empty());
    RC_ASSERT(component.front() != '/');
    RC_ASSERT(component.back() != '/');
}

} // namespace
} // namespace kestrum
