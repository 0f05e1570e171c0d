#include "ui/NavigationStack.h"

#include "ui/KestrumPaneController.h"
#include "ui/KestrumSaveViewController.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace kestrum {

NavigationStack::NavigationStack(Toolkit& toolkit, std::shared_ptr<KestrumPaneController> root)
    : _panes{std::move(root)}, _view(toolkit.makeNavigationView(*this))
{
    topViewController().setNavigationController(this);
    show(topViewController(), Transition::None, false);
}

NavigationStack::~NavigationStack()
{
    // A pane may have other owners and outlive the stack.
    for (const auto& pane : _panes)
        pane->setNavigationController(nullptr);
}

void NavigationStack::pushViewController(std::shared_ptr<KestrumPaneController> pane, bool animated)
{
    // Panes under the save screen take no input of any kind.
    if (_presenting)
        return;
    topViewController().viewWillDisappear(animated);
    _panes.push_back(std::move(pane));
    topViewController().setNavigationController(this);
    show(topViewController(), Transition::Push, animated);
}

void NavigationStack::popToViewController(const KestrumPaneController& pane, bool animated)
{
    const auto found = std::ranges::find(_panes, &pane, &std::shared_ptr<KestrumPaneController>::get);
    if (found == _panes.end() || std::next(found) == _panes.end())
        return;
    topViewController().viewWillDisappear(animated);
    // The view draws the old pane until it shows another one. The panes are destroyed after that.
    const Panes leaving(std::next(found), _panes.end());
    _panes.erase(std::next(found), _panes.end());
    for (const auto& each : leaving)
        each->setNavigationController(nullptr);
    show(topViewController(), Transition::Pop, animated);
}

void NavigationStack::popToRootViewController(bool animated)
{
    popToViewController(*_panes.front(), animated);
}

void NavigationStack::presentViewController(KestrumSaveViewController& screen, bool animated)
{
    topViewController().viewWillDisappear(animated);
    screen.viewWillAppear(animated);
    _presenting = true;
    _view->present(screen.interface(), animated);
}

void NavigationStack::dismissViewController(bool animated)
{
    if (!std::exchange(_presenting, false))
        return;
    topViewController().viewWillAppear(animated);
    _view->dismiss(animated);
}

void NavigationStack::setToolbarHidden(bool hidden)
{
    _view->setToolbarHidden(hidden);
}

void NavigationStack::titlesChanged()
{
    // A pane that is about to be shown passes its title with `show`.
    if (_shown == &topViewController())
        _view->setTitles(titles());
}

void NavigationStack::backRequested()
{
    if (!_presenting && _panes.size() > 1)
        popToViewController(**std::prev(_panes.end(), 2), true);
}

void NavigationStack::lookRequested(Look look)
{
    if (!_presenting && _delegate)
        _delegate->lookRequested(look);
}

void NavigationStack::show(KestrumPaneController& pane, Transition transition, bool animated)
{
    pane.viewWillAppear(animated);
    if (_delegate)
        _delegate->willShowViewController(*this, pane, animated);
    _shown = &pane;
    _view->show(pane.screen(), titles(), transition, animated);
}

std::vector<std::string> NavigationStack::titles() const
{
    std::vector<std::string> titles;
    for (const auto& pane : _panes)
        titles.push_back(pane->screen().title());
    return titles;
}

} // namespace kestrum
