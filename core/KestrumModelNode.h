#pragma once

#include "support/Value.h"

#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

class KestrumModelNode;

/// Nodes never change, so whoever holds one may keep it after the tree was built anew.
using KestrumModelNodeRef = std::shared_ptr<const KestrumModelNode>;
using KestrumModelNodes = std::vector<KestrumModelNodeRef>;
/// Node path to node. Sorted, for paths can be chosen to collide in any hash.
using PathDictionary = std::map<std::string, KestrumModelNodeRef>;

inline constexpr std::string_view kRootPath = "/";

/// The path of a child: its display name behind the parent's path, with exactly one "/" between them. Slashes at the
/// name's ends are left out, those inside stay; of a name of which nothing is left, "(empty)" stands there.
std::string joinPath(std::string_view path, std::string_view name);

/// A row of the display, and what lies below it.
class KestrumModelNode {
public:
    virtual ~KestrumModelNode() = default;
    KestrumModelNode(const KestrumModelNode&) = delete;
    KestrumModelNode& operator=(const KestrumModelNode&) = delete;

    const std::string& displayName() const { return _name; }
    /// The rows of an inner node, perhaps none; null for a leaf. This alone tells the one from the other.
    virtual const KestrumModelNodes* childNodes() const { return nullptr; }
    /// The text of a leaf; null for an inner node.
    virtual const std::string* value() const { return nullptr; }

    /// The tree of a display, named "Kestrum" at "/"; never null. Fills the empty dictionary with a node for each
    /// path: of several nodes with the same path, the one built last. Paths of more than 64 MiB in all are not kept.
    ///
    /// Recursive: for values as property lists bound them, a few hundred levels deep.
    static KestrumModelNodeRef makeTreeFromObject(const Value& object, PathDictionary& withPathDictionary);

protected:
    explicit KestrumModelNode(std::string name) : _name(std::move(name)) {}

private:
    std::string _name;
};

class KestrumModelLeafNode final : public KestrumModelNode {
public:
    KestrumModelLeafNode(std::string name, std::string withValue)
        : KestrumModelNode(std::move(name)), _string(std::move(withValue))
    {}

    const std::string* value() const override { return &_string; }

private:
    std::string _string;
};

class KestrumModelTreeNode final : public KestrumModelNode {
public:
    KestrumModelTreeNode(std::string name, KestrumModelNodes withChildren)
        : KestrumModelNode(std::move(name)), _childNodes(std::move(withChildren))
    {}

    const KestrumModelNodes* childNodes() const override { return &_childNodes; }

private:
    KestrumModelNodes _childNodes;
};

/// The node of one value under a display name, registered in the dictionary under its path, behind its children.
KestrumModelNodeRef buildNode(std::string name, const Value& object, PathDictionary& pathDictionary,
                              const std::string& path);

} // namespace kestrum
