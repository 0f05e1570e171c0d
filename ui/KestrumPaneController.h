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

/// One level of the display tree as a table: a row per child node.
class KestrumPaneController final : public TableDataSource {
public:
    using Node = std::shared_ptr<const KestrumModelNode>;

    /// `node` may be null: no rows. `atPath` is its path, "/" for the root pane.
    KestrumPaneController(Toolkit& toolkit, SharedApplication& application, Node node, std::string atPath);

    const std::string& path() const { return _keyPath; }
    TableScreen& screen() { return *_screen; }

    /// Told by the stack: before the pane comes onto the screen, and before it leaves it.
    void viewWillAppear(bool animated);
    void viewWillDisappear(bool animated);
    /// The stack that holds the pane; null as soon as it does no longer.
    void setNavigationController(NavigationStack* navigationController);

    /// The toolbar's text, none for nothing, and whether its activity indicator runs.
    void setStatus(std::optional<std::string_view> status, bool isLoading);
    /// Replaces the node by the one of a newer tree.
    void reloadWithNode(Node node);

    std::size_t numberOfRowsInSection(TableView& table, std::size_t section) override;
    std::shared_ptr<ReusableCell> cellForRowAtIndexPath(TableView& table, IndexPath indexPath) override;
    void didSelectRowAtIndexPath(TableView& table, std::optional<IndexPath> indexPath) override;

private:
    void createToolbarItems();
    void updateTitle();
    /// Null for a row that is gone.
    Node childAtIndexPath(IndexPath indexPath) const;

    Toolkit& _toolkit;
    SharedApplication& _application;
    NavigationStack* _navigationController = nullptr;
    Node _nodes; ///< one node, despite the name: its children are the rows
    std::string _keyPath;
    std::string _status;
    bool _isLoading = true;
    std::unique_ptr<TableScreen> _screen;
};

} // namespace kestrum
