#pragma once

#include "support/Value.h"

#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

class KestrumModelNode;

/// Nodes are immutable: a reference stays valid after the tree is rebuilt.
using KestrumModelNodeRef = std::shared_ptr<const KestrumModelNode>;
using KestrumModelNodes = std::vector<KestrumModelNodeRef>;

inline constexpr std::string_view kRootPath = "/";

/// The path of a child: the parent's path, one "/" and the child's display name. Leading and trailing slashes of the
/// name are removed; "(empty)" replaces a name without other characters.
std::string joinPath(std::string_view path, std::string_view name);

/// Maps paths to the nodes of a tree; of nodes with the same path it finds the one built last. Stores no paths but
/// descends from the root: each refresh builds a tree of thousands of nodes, and a screen asks for the few it shows.
class PathDictionary {
public:
    PathDictionary() = default;
    /// A node and the nodes below it.
    PathDictionary(std::string path, KestrumModelNodeRef node) : _path(std::move(path)), _node(std::move(node)) {}

    /// Null when no node has the path. Visits a node at most once, whatever the names are.
    KestrumModelNodeRef find(std::string_view path) const;

private:
    std::string _path;
    KestrumModelNodeRef _node;
};

/// The keys, and the indexes in lists, that lead to a row of the node at the path, in the object that the tree was made
/// from. Empty when there is no such row.
std::vector<std::string> stepsToRow(const Value& object, std::string_view path, std::size_t row);

/// A row of the display and the rows below it.
class KestrumModelNode {
public:
    virtual ~KestrumModelNode() = default;
    KestrumModelNode(const KestrumModelNode&) = delete;
    KestrumModelNode& operator=(const KestrumModelNode&) = delete;

    const std::string& displayName() const { return _name; }
    /// The rows of an inner node, possibly none; null for a leaf.
    virtual const KestrumModelNodes* childNodes() const { return nullptr; }
    /// The text of a leaf; null for an inner node.
    virtual const std::string* value() const { return nullptr; }

    /// Builds the tree of a display; the root is named "Kestrum" and has the path "/". Never null. The dictionary then
    /// has the paths of its nodes.
    ///
    /// Recursive: at most as deep as property lists may be (512 levels).
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

/// Builds the node of a value. The dictionary then has its path and those of the nodes below it.
KestrumModelNodeRef buildNode(std::string name, const Value& object, PathDictionary& pathDictionary, std::string path);

} // namespace kestrum
