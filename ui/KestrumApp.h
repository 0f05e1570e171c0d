#pragma once

#include "core/KestrumModel.h"
#include "platform/ApplicationDelegate.h"
#include "platform/MainQueue.h"
#include "platform/Roles.h"
#include "platform/Window.h"
#include "ui/DateFormatter.h"
#include "ui/KestrumPaneController.h"
#include "ui/KestrumSaveViewController.h"
#include "ui/NavigationStack.h"
#include "ui/SharedApplication.h"

#include <memory>
#include <optional>
#include <string>

namespace kestrum {

/// The application: a window, a stack of panes in it, and the monitor model that they show.
class KestrumApp final : public std::enable_shared_from_this<KestrumApp>,
                         public ApplicationDelegate,
                         public NavigationStackDelegate,
                         public KestrumModelObserver,
                         public SharedApplication {
public:
    /// Does nothing before it is launched. The roles are borrowed: they outlive the application and what it leaves in
    /// the queue, the model of a running refresh timer included.
    static std::shared_ptr<KestrumApp> make(ApplicationRoles& roles);
    ~KestrumApp() override;

    void applicationDidFinishLaunching() override;
    void applicationWillTerminate() override;

    /// Offers the Save button where the device software is an internal installation.
    void getSaveButtonPref();
    /// Whether the home screen shows the GSM signal strength as a number.
    void _setGSMRSSI(bool value);

    void showSaveView() override;
    void closeSaveView() override;
    void showNotice(std::string_view text) override;

    /// Gives the pane the status as it is now.
    void updateStatusForViewController(KestrumPaneController& viewController);
    /// New data: gives every pane the node that now stands at its path, and drops those whose path is gone.
    void updateViewControllerFromModel() override;
    /// An attempt to connect has ended: the pane on the screen says so.
    void updateStatus() override;
    /// Another technology's display: nothing that was opened in the old one stays open.
    void displayReplaced() override;
    void messagesLost() override;
    void willShowViewController(NavigationStack& navigationController, KestrumPaneController& viewController,
                                bool animated) override;

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
    explicit KestrumApp(ApplicationRoles& roles);

    bool isConnected() const { return _model && _model->isConnected(); }
    void releaseModel();
    /// Keeps the root pane's hint: there once a connection has been missing for `kConnectionPatience`.
    void followConnection();

    ApplicationRoles& _roles;
    // In this order, so that at the end what borrows goes before what it borrows.
    std::shared_ptr<KestrumModel> _model;
    std::optional<DateFormatter> _dateFormatter;
    std::shared_ptr<KestrumSaveViewController> _saveViewController;
    std::unique_ptr<NavigationStack> _navController;
    std::shared_ptr<Window> _window;
    std::unique_ptr<Timer> _unconnected; ///< there while no connection is
    std::unique_ptr<Timer> _noticeEnd;   ///< there while a notice is shown

    // The properties have storage of their own. Those for the window and the save screen are only ever cleared, which
    // leaves the window and the save screen in use alone: kept so on purpose.
    struct {
        std::optional<std::string> updateMessage;
        bool allowSaveButton = false;
        std::shared_ptr<Window> window;
        std::shared_ptr<KestrumSaveViewController> saveViewController;
    } _properties;
};

} // namespace kestrum
