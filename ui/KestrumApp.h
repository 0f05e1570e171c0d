#pragma once

#include "core/KestrumModel.h"
#include "insight/History.h"
#include "platform/ApplicationDelegate.h"
#include "platform/MainQueue.h"
#include "platform/Roles.h"
#include "platform/Window.h"
#include "ui/DateFormatter.h"
#include "ui/Freeze.h"
#include "ui/KestrumPaneController.h"
#include "ui/KestrumSaveViewController.h"
#include "ui/NavigationStack.h"
#include "ui/SharedApplication.h"
#include "ui/Sheets.h"

#include <memory>
#include <optional>
#include <string>

namespace kestrum {

/// The application: a window with a stack of panes, and the monitor model that they show.
class KestrumApp final : public std::enable_shared_from_this<KestrumApp>,
                         public ApplicationDelegate,
                         public NavigationStackDelegate,
                         public KestrumModelObserver,
                         public SharedApplication {
public:
    /// Does nothing before the launch. The roles are borrowed. They outlive the application and its tasks and timers in
    /// the queue, which own the model while monitoring runs.
    /// Without a history nothing but the present can be shown.
    static std::shared_ptr<KestrumApp> make(ApplicationRoles& roles, bool hasHistory = true);
    ~KestrumApp() override;

    void applicationDidFinishLaunching() override;
    void applicationWillTerminate() override;

    /// Offers the Save button when the device software is an internal installation.
    void getSaveButtonPref();
    /// Sets whether the home screen shows the GSM signal strength as a number.
    void _setGSMRSSI(bool value);

    void showSaveView() override;
    void closeSaveView() override;
    void showNotice(std::string_view text) override;

    /// Shows the current status in the pane.
    void updateStatusForViewController(KestrumPaneController& viewController);
    /// New data: gives each pane the node at its path, and closes panes whose path no longer exists.
    void updateViewControllerFromModel() override;
    /// An attempt to connect has ended: updates the status of the shown pane.
    void updateStatus() override;
    /// Another technology's display: closes all panes but the root.
    void displayReplaced() override;
    void messagesLost() override;
    void willShowViewController(NavigationStack& navigationController, KestrumPaneController& viewController,
                                bool animated) override;
    /// Freezes what is shown, goes to another moment, or returns to the modem.
    void lookRequested(Look look) override;
    bool offers(SheetKind kind, std::optional<std::size_t> row) const override;
    void sheetRequested(SheetKind kind, std::optional<std::size_t> row) override;
    void keepRequested() override;

    const std::optional<std::string>& updateMessage() const { return _properties.updateMessage; }
    void setUpdateMessage(std::optional<std::string> message) { _properties.updateMessage = std::move(message); }
    bool allowSaveButton() const override { return _properties.allowSaveButton; }
    void setAllowSaveButton(bool allow) { _properties.allowSaveButton = allow; }
    const std::shared_ptr<Window>& window() const { return _properties.window; }
    void setWindow(std::shared_ptr<Window> window) { _properties.window = std::move(window); }
    const std::shared_ptr<KestrumSaveViewController>& saveViewController() const
    {
        return _properties.saveViewController;
    }
    void setSaveViewController(std::shared_ptr<KestrumSaveViewController> screen)
    {
        _properties.saveViewController = std::move(screen);
    }

private:
    KestrumApp(ApplicationRoles& roles, bool hasHistory);

    bool isConnected() const { return _model && _model->isConnected(); }
    void releaseModel();
    /// Shows the root pane's hint after `kConnectionPatience` without a connection, and removes it on connection.
    void followConnection();
    /// The program's and the user's. A bad file of the user is told.
    Thresholds readThresholds();
    Shown shown() const;
    void closePanes();
    void reloadPanes();
    void offerMoments();
    void returnToLive();

    ApplicationRoles& _roles;
    History _history; ///< stays empty without a history
    const bool _hasHistory;
    Freeze _freeze;
    KestrumModelNodeRef _newest;       ///< the display that live panes show; null when they show none
    bool _replacedWhileFrozen = false; ///< by that of another technology
    // In this order, so that a member is destroyed before the members that it borrows.
    std::shared_ptr<KestrumModel> _model;
    std::optional<DateFormatter> _dateFormatter;
    std::shared_ptr<KestrumSaveViewController> _saveViewController;
    std::unique_ptr<NavigationStack> _navController;
    std::optional<Sheets> _sheets; ///< over the panes
    std::shared_ptr<Window> _window;
    std::unique_ptr<Timer> _unconnected; ///< not null while there is no connection
    std::unique_ptr<Timer> _noticeEnd;   ///< not null while a notice is shown

    // Kept: the properties are separate from the members above. Clearing the property `window` or `saveViewController`
    // does not close the window or the save screen in use.
    struct {
        std::optional<std::string> updateMessage;
        bool allowSaveButton = false;
        std::shared_ptr<Window> window;
        std::shared_ptr<KestrumSaveViewController> saveViewController;
    } _properties;
};

} // namespace kestrum
