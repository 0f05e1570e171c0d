#pragma once

#include "platform/NavigationView.h"
#include "platform/Toolkit.h"

#include <memory>
#include <string>
#include <vector>

namespace kestrum {

class KestrumPaneController;
class KestrumSaveViewController;
class NavigationStack;

/// Who is told what the stack is about to show.
class NavigationStackDelegate {
public:
    virtual ~NavigationStackDelegate() = default;
    /// Before a pushed or revealed pane is on the screen; it is the stack's top by then.
    virtual void willShowViewController(NavigationStack& navigationController, KestrumPaneController& viewController,
                                        bool animated) = 0;
};

/// The panes that the user has opened, root first, and the save screen over them. Keeps the order and tells the
/// controllers what happens to them; the navigation view only draws. Every change is complete when its call returns:
/// animation delays nothing.
class NavigationStack final : private NavigationViewDelegate {
public:
    using Panes = std::vector<std::shared_ptr<KestrumPaneController>>;

    /// Starts with `root`, which is never popped. The delegate hears of later panes only.
    NavigationStack(Toolkit& toolkit, std::shared_ptr<KestrumPaneController> root);
    ~NavigationStack() override;
    NavigationStack(const NavigationStack&) = delete;
    NavigationStack& operator=(const NavigationStack&) = delete;

    void setDelegate(NavigationStackDelegate* delegate) { _delegate = delegate; }
    NavigationView& view() { return *_view; }

    const Panes& viewControllers() const { return _panes; }
    KestrumPaneController& topViewController() const { return *_panes.back(); }

    /// Nothing happens under the save screen.
    void pushViewController(std::shared_ptr<KestrumPaneController> pane, bool animated);
    /// Drops what lies over `pane`. Nothing happens when it is the top, or not on the stack.
    void popToViewController(const KestrumPaneController& pane, bool animated);
    void popToRootViewController(bool animated);

    /// The save screen, over the panes; borrowed until it is dismissed.
    void presentViewController(KestrumSaveViewController& screen, bool animated);
    void dismissViewController(bool animated);

    void setToolbarHidden(bool hidden);
    /// A pane of the stack has another title.
    void titlesChanged();

private:
    void backRequested() override;

    void show(KestrumPaneController& pane, Transition transition, bool animated);
    std::vector<std::string> titles() const;

    NavigationStackDelegate* _delegate = nullptr;
    Panes _panes;
    const KestrumPaneController* _shown = nullptr; ///< the pane that the view draws
    bool _presenting = false;
    std::unique_ptr<NavigationView> _view; // behind the panes: it ends first, for it draws their screens
};

} // namespace kestrum
