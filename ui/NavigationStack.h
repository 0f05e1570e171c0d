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

/// Receives the stack's notifications.
class NavigationStackDelegate {
public:
    virtual ~NavigationStackDelegate() = default;
    /// A pushed or revealed pane is about to be shown. It is already the top of the stack.
    virtual void willShowViewController(NavigationStack& navigationController, KestrumPaneController& viewController,
                                        bool animated) = 0;
    /// The user wants to see another moment. Not while the save screen is shown.
    virtual void lookRequested(Look) {}
    virtual bool offers(SheetKind, std::optional<std::size_t>) const { return false; }
    virtual void sheetRequested(SheetKind, std::optional<std::size_t>) {}
    virtual void keepRequested() {}
};

/// The open panes, root first, and the save screen over them. Owns the panes and notifies their controllers; the
/// navigation view only draws. A change is complete when its call returns, also while an animation is drawn.
class NavigationStack final : private NavigationViewDelegate {
public:
    using Panes = std::vector<std::shared_ptr<KestrumPaneController>>;

    /// Starts with `root`, which is never popped. The delegate is not notified of it.
    NavigationStack(Toolkit& toolkit, std::shared_ptr<KestrumPaneController> root);
    ~NavigationStack() override;
    NavigationStack(const NavigationStack&) = delete;
    NavigationStack& operator=(const NavigationStack&) = delete;

    void setDelegate(NavigationStackDelegate* delegate) { _delegate = delegate; }
    NavigationView& view() { return *_view; }

    const Panes& viewControllers() const { return _panes; }
    KestrumPaneController& topViewController() const { return *_panes.back(); }

    /// Does nothing while the save screen is shown.
    void pushViewController(std::shared_ptr<KestrumPaneController> pane, bool animated);
    /// Removes the panes over `pane`. Does nothing when it is the top or not on the stack.
    void popToViewController(const KestrumPaneController& pane, bool animated);
    void popToRootViewController(bool animated);

    /// Shows the save screen over the panes. It is borrowed until it is dismissed.
    void presentViewController(KestrumSaveViewController& screen, bool animated);
    void dismissViewController(bool animated);

    void setToolbarHidden(bool hidden);
    /// The title of a pane of the stack has changed.
    void titlesChanged();

private:
    void backRequested() override;
    void lookRequested(Look look) override;
    bool offers(SheetKind kind, std::optional<std::size_t> row) const override
    {
        return _delegate && !_presenting && _delegate->offers(kind, row);
    }
    void sheetRequested(SheetKind kind, std::optional<std::size_t> row) override
    {
        if (offers(kind, row))
            _delegate->sheetRequested(kind, row);
    }
    void keepRequested() override
    {
        if (_delegate && !_presenting)
            _delegate->keepRequested();
    }

    void show(KestrumPaneController& pane, Transition transition, bool animated);
    std::vector<std::string> titles() const;

    NavigationStackDelegate* _delegate = nullptr;
    Panes _panes;
    const KestrumPaneController* _shown = nullptr; ///< the pane that the view draws
    bool _presenting = false;
    std::unique_ptr<NavigationView> _view; // after the panes: destroyed first, because it draws their screens
};

} // namespace kestrum
