#include "ui/KestrumApp.h"

#include "core/KestrumModelNode.h"
#include "platform/Clock.h"
#include "platform/FileSystem.h"
#include "platform/Preferences.h"
#include "platform/TableScreen.h"
#include "platform/Toolkit.h"
#include "ui/ConnectionHint.h"

#include <utility>

namespace kestrum {
namespace {

constexpr std::string_view kInternalInstallMarker =
    "/NorvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle";
constexpr std::string_view kShowGSMRSSI = "HXShowGSMRSSI";
constexpr std::string_view kConnecting = "Connecting...";
constexpr std::chrono::seconds kNoticeTime{8}; // enough to read a path

} // namespace

std::shared_ptr<KestrumApp> KestrumApp::make(ApplicationRoles& roles)
{
    return std::shared_ptr<KestrumApp>(new KestrumApp(roles));
}

KestrumApp::KestrumApp(ApplicationRoles& roles) : _roles(roles) {}

KestrumApp::~KestrumApp()
{
    releaseModel();
}

void KestrumApp::applicationDidFinishLaunching()
{
    getSaveButtonPref();
    _window = _roles.toolkit.makeWindow(_roles.toolkit.mainScreenBounds());
    _model = std::make_shared<KestrumModel>(_roles);
    _model->setObserver(this);
    setUpdateMessage(std::string(kConnecting));
    _dateFormatter.emplace(_roles.clock, "'Updated' yyyy-MM-dd 'at' HH:mm:ss");

    auto root = std::make_shared<KestrumPaneController>(_roles.toolkit, *this, nullptr, "/");
    root->setStatus("Connecting", true); // without dots until the first attempt has ended
    _navController = std::make_unique<NavigationStack>(_roles.toolkit, std::move(root));
    _navController->setDelegate(this);
    _window->setRoot(_navController->view());
    _window->makeKeyAndVisible();
    followConnection();

    // Shows the first screen before the channel is opened.
    _roles.queue.post([self = shared_from_this()] {
        if (const auto model = self->_model)
            model->restartMonitor();
    });
}

void KestrumApp::applicationWillTerminate()
{
    _setGSMRSSI(false);
    setUpdateMessage(std::nullopt);
    _unconnected.reset();
    _noticeEnd.reset();
    _dateFormatter.reset();
    setSaveViewController(nullptr);
    if (_window)
        _window->orderOut();
    setWindow(nullptr);
    releaseModel();
}

void KestrumApp::getSaveButtonPref()
{
    setAllowSaveButton(_roles.files.exists(kInternalInstallMarker));
}

void KestrumApp::_setGSMRSSI(bool value)
{
    _roles.preferences.setApplicationValue(kHomeScreenDomain, kShowGSMRSSI, value);
    _roles.preferences.synchronize(kHomeScreenDomain);
    _roles.preferences.postChanged(kHomeScreenDomain, kShowGSMRSSI);
}

void KestrumApp::showSaveView()
{
    if (_saveViewController || !_model)
        return;
    _saveViewController = std::make_shared<KestrumSaveViewController>(_roles, *this, _model->getSaveContents());
    _navController->presentViewController(*_saveViewController, true);
}

void KestrumApp::closeSaveView()
{
    if (!_saveViewController)
        return;
    _navController->dismissViewController(true);
    _saveViewController.reset();
}

void KestrumApp::showNotice(std::string_view text)
{
    if (!_navController)
        return;
    _navController->view().setNotice(text);
    _noticeEnd = _roles.queue.repeat(kNoticeTime, [this] {
        _navController->view().setNotice("");
        _noticeEnd.reset();
    });
}

void KestrumApp::updateStatusForViewController(KestrumPaneController& viewController)
{
    if (isConnected())
        viewController.setStatus(updateMessage(), false);
    else
        viewController.setStatus(kConnecting, true);
}

void KestrumApp::updateViewControllerFromModel()
{
    if (!_model)
        return;
    const auto& panes = _navController->viewControllers();
    panes.front()->reloadWithNode(_model->topLevelNodes());
    for (std::size_t i = 1; i < panes.size(); ++i) {
        auto node = _model->nodeAtPath(panes[i]->path());
        if (!node) {
            _navController->popToViewController(*panes[i - 1], true);
            break;
        }
        panes[i]->reloadWithNode(std::move(node));
    }
    if (isConnected())
        setUpdateMessage(_dateFormatter->stringFromDate(_roles.clock.now()));
    updateStatus();
}

void KestrumApp::updateStatus()
{
    if (!_navController)
        return;
    updateStatusForViewController(_navController->topViewController());
    followConnection();
}

void KestrumApp::followConnection()
{
    TableScreen& root = _navController->viewControllers().front()->screen();
    if (!_model || isConnected()) {
        _unconnected.reset();
        root.setHint("");
    } else if (!_unconnected) {
        _unconnected = _roles.queue.repeat(kConnectionPatience, [this, &root] {
            root.setHint(connectionHint(_model ? _model->connectionProblem() : std::nullopt));
        });
    }
}

void KestrumApp::displayReplaced()
{
    if (!_navController)
        return;
    _navController->popToRootViewController(true);
    _navController->topViewController().reloadWithNode(nullptr);
}

void KestrumApp::messagesLost()
{
    showNotice(_model->lossNotice());
}

void KestrumApp::releaseModel()
{
    // While monitoring runs the refresh timer owns the model too: the channel stays open until the queue is cleared.
    if (const auto model = std::exchange(_model, nullptr))
        model->setObserver(nullptr);
}

void KestrumApp::willShowViewController(NavigationStack&, KestrumPaneController& viewController, bool)
{
    updateStatusForViewController(viewController);
}

} // namespace kestrum
