#pragma once

#include "platform/TableScreen.h"
#include "platform/Toolkit.h"

#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace kestrum {

class KestrumModelNode;
class NavigationStack;
class SharedApplication;

/// One level of the display tree as a table: a row for each child node.
class KestrumPaneController final : public TableDataSource {
public:
    using Node = std::shared_ptr<const KestrumModelNode>;

    /// `node` may be null: the pane has no rows. `atPath` is the node's path, "/" for the root pane.
    KestrumPaneController(Toolkit& toolkit, SharedApplication& application, Node node, std::string atPath);

    const std::string& path() const { return _keyPath; }
    const Node& node() const { return _nodes; }
    TableScreen& screen() { return *_screen; }
    /// The node of a row; null when the row no longer exists.
    Node childAt(std::size_t row) const;

    /// Called by the stack before the pane appears and before it disappears.
    void viewWillAppear(bool animated);
    void viewWillDisappear(bool animated);
    /// The stack that owns the pane; null after the pane was removed.
    void setNavigationController(NavigationStack* navigationController);

    /// Sets the toolbar's text (nothing: none) and whether the activity indicator runs.
    void setStatus(std::optional<std::string_view> status, bool isLoading);
    /// Replaces the node by that of a newer tree.
    void reloadWithNode(Node node);

    std::size_t numberOfRowsInSection(TableView& table, std::size_t section) override;
    std::shared_ptr<ReusableCell> cellForRowAtIndexPath(TableView& table, IndexPath indexPath) override;
    void didSelectRowAtIndexPath(TableView& table, std::optional<IndexPath> indexPath) override;

private:
    void createToolbarItems();
    void updateTitle();

    Toolkit& _toolkit;
    SharedApplication& _application;
    NavigationStack* _navigationController = nullptr;
    Node _nodes; ///< one node; its children are the rows
    std::string _keyPath;
    std::string _status;
    bool _isLoading = true;
    std::unique_ptr<TableScreen> _screen;
};

} // namespace kestrum
