#include "ui/KestrumPaneController.h"

#include "core/KestrumModelNode.h"
#include "ui/KestrumCell.h"
#include "ui/NavigationStack.h"
#include "ui/SharedApplication.h"

#include <utility>
#include <vector>

namespace kestrum {
namespace {

// One identifier for both kinds of cell: the table may offer either kind for any row.
constexpr std::string_view kReuseIdentifier = "KestrumPaneControllerCell";

} // namespace

KestrumPaneController::KestrumPaneController(Toolkit& toolkit, SharedApplication& application, Node node,
                                             std::string atPath)
    : _toolkit(toolkit),
      _application(application),
      _nodes(std::move(node)),
      _keyPath(std::move(atPath)),
      _screen(toolkit.makeTableScreen(*this))
{}

void KestrumPaneController::viewWillAppear(bool)
{
    updateTitle();
    if (_navigationController)
        _navigationController->setToolbarHidden(false);
    createToolbarItems();
}

void KestrumPaneController::viewWillDisappear(bool)
{
    _screen->resignFirstResponder();
}

void KestrumPaneController::setNavigationController(NavigationStack* navigationController)
{
    _navigationController = navigationController;
}

void KestrumPaneController::setStatus(std::optional<std::string_view> status, bool isLoading)
{
    _status = status.value_or("");
    _isLoading = isLoading;
    createToolbarItems();
}

void KestrumPaneController::reloadWithNode(Node node)
{
    _nodes = std::move(node);
    updateTitle();
    _screen->table().reloadData();
    createToolbarItems();
}

std::size_t KestrumPaneController::numberOfRowsInSection(TableView&, std::size_t)
{
    const auto* children = _nodes ? _nodes->childNodes() : nullptr;
    return children ? children->size() : 0;
}

std::shared_ptr<ReusableCell> KestrumPaneController::cellForRowAtIndexPath(TableView& table, IndexPath indexPath)
{
    const auto child = childAt(indexPath.row);
    auto cell = std::static_pointer_cast<KestrumCell>(table.dequeueReusableCell(kReuseIdentifier));
    // A reused cell may be of the other kind: a leaf then shows its name only, an inner row keeps an empty strip.
    if (child && child->childNodes()) {
        if (!cell)
            cell = KestrumCell::initWithStyleKey(_toolkit, table, CellStyle::KeyAndDetail, kReuseIdentifier);
        cell->setTexts(child->displayName(), std::nullopt);
        cell->cell().setAccessory(Accessory::DisclosureIndicator);
        cell->setLayoutKey();
    } else {
        if (!cell)
            cell = KestrumCell::initWithStyle(_toolkit, table, CellStyle::KeyAndDetail, kReuseIdentifier);
        if (child)
            cell->setTexts(child->displayName(), *child->value());
        else
            cell->setTexts("", std::nullopt); // the row was removed before the table reloaded
        cell->cell().setAccessory(Accessory::None);
        cell->setLayout();
    }
    return cell;
}

void KestrumPaneController::didSelectRowAtIndexPath(TableView& table, std::optional<IndexPath> indexPath)
{
    const auto child = indexPath ? childAt(indexPath->row) : nullptr;
    if (!child)
        return; // no row, or a row that was just removed
    if (!child->childNodes()) {
        table.deselectRow(*indexPath, false);
        return;
    }
    // A second tap can reach a pane that the first tap has already covered.
    if (!_navigationController || &_navigationController->topViewController() != this)
        return;
    auto pane = std::make_shared<KestrumPaneController>(_toolkit, _application, child,
                                                        joinPath(_keyPath, child->displayName()));
    pane->setStatus(_status, _isLoading);
    _navigationController->pushViewController(std::move(pane), true);
}

/// From the left: activity indicator, status, and at the right edge the Save button when it is offered.
void KestrumPaneController::createToolbarItems()
{
    std::vector<ToolbarItem> items{ActivityIndicatorItem{_isLoading}, LabelItem{_status, systemFont(14)},
                                   FlexibleSpaceItem{}};
    if (_application.allowSaveButton())
        items.push_back(SaveItem{[&application = _application] { application.showSaveView(); }});
    _screen->setToolbarItems(std::move(items), true);
}

void KestrumPaneController::updateTitle()
{
    const std::string title = _nodes ? _nodes->displayName() : "Kestrum";
    if (title == _screen->title())
        return;
    _screen->setTitle(title);
    if (_navigationController)
        _navigationController->titlesChanged();
}

KestrumPaneController::Node KestrumPaneController::childAt(std::size_t row) const
{
    const auto* children = _nodes ? _nodes->childNodes() : nullptr;
    return children && row < children->size() ? (*children)[row] : nullptr;
}

} // namespace kestrum
