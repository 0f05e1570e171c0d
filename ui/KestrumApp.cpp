#include "ui/KestrumApp.h"

#include "core/KestrumModelNode.h"
#include "platform/Clock.h"
#include "platform/FileSystem.h"
#include "platform/Preferences.h"
#include "platform/SystemLog.h"
#include "platform/TableScreen.h"
#include "platform/Toolkit.h"
#include "support/Format.h"
#include "ui/ConnectionHint.h"
#include "ui/Keep.h"

#include <utility>

namespace kestrum {
namespace {

constexpr std::string_view kInternalInstallMarker =
    "/NorvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle";
constexpr std::string_view kShowGSMRSSI = "HXShowGSMRSSI";
constexpr std::string_view kConnecting = "Connecting...";
constexpr std::string_view kNothingToFreeze = "There is nothing to freeze yet";
constexpr std::chrono::seconds kNoticeTime{8}; // enough to read a path

} // namespace

std::shared_ptr<KestrumApp> KestrumApp::make(ApplicationRoles& roles, bool hasHistory)
{
    return std::shared_ptr<KestrumApp>(new KestrumApp(roles, hasHistory));
}

KestrumApp::KestrumApp(ApplicationRoles& roles, bool hasHistory)
    : _roles(roles), _history(roles.clock), _hasHistory(hasHistory), _freeze(_history.moments(), roles.clock)
{}

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
    if (_hasHistory)
        _model->setWatch(&_history);
    setUpdateMessage(std::string(kConnecting));
    _dateFormatter.emplace(_roles.clock, "'Updated' yyyy-MM-dd 'at' HH:mm:ss");

    auto root = std::make_shared<KestrumPaneController>(_roles.toolkit, *this, nullptr, "/");
    root->setStatus("Connecting", true); // without dots until the first attempt has ended
    _navController = std::make_unique<NavigationStack>(_roles.toolkit, std::move(root));
    _navController->setDelegate(this);
    _sheets.emplace(_navController->view(), _history, readThresholds(), _roles.clock);
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
    const auto contents = _freeze.isOn() ? _model->getSaveContents(_freeze.history()) : _model->getSaveContents();
    _saveViewController = std::make_shared<KestrumSaveViewController>(_roles, *this, contents);
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

Thresholds KestrumApp::readThresholds()
{
    Thresholds thresholds;
    const auto file = _roles.files.configuration(kThresholdsFile);
    if (const auto problem = file.problem ? file.problem : thresholds.read(file.text)) {
        const auto text = formatted("%@: %@", file.path, problem->text);
        _roles.log.write(Priority::Error, "%@", text);
        showNotice(text);
    }
    return thresholds;
}

void KestrumApp::keepRequested()
{
    keepHistory(_history, _roles, *this);
}

void KestrumApp::updateStatusForViewController(KestrumPaneController& viewController)
{
    if (_freeze.isOn())
        viewController.setStatus(_freeze.status(), !isConnected());
    else if (isConnected())
        viewController.setStatus(updateMessage(), false);
    else
        viewController.setStatus(kConnecting, true);
}

void KestrumApp::updateViewControllerFromModel()
{
    if (!_model)
        return;
    _newest = _model->topLevelNodes(); // while the panes stand still too: the history goes on
    if (_freeze.isOn())
        offerMoments();
    else
        reloadPanes();
    if (isConnected())
        setUpdateMessage(_dateFormatter->stringFromDate(_roles.clock.now()));
    updateStatus();
}

void KestrumApp::reloadPanes()
{
    const auto& panes = _navController->viewControllers();
    panes.front()->reloadWithNode(_newest);
    for (std::size_t i = 1; i < panes.size(); ++i) {
        auto node = _model->nodeAtPath(panes[i]->path());
        if (!node) {
            _navController->popToViewController(*panes[i - 1], true);
            break;
        }
        panes[i]->reloadWithNode(std::move(node));
    }
    if (_model)
        _sheets->refresh(shown());
}

void KestrumApp::lookRequested(Look look)
{
    const bool wasLive = !_freeze.isOn();
    if (wasLive && look == Look::Later)
        return;
    if (!wasLive && look == Look::Freeze) {
        returnToLive();
        return;
    }
    // Without a display now, the newest moment is an earlier one.
    if (wasLive && ((look == Look::Freeze && !_newest) || !_freeze.begin())) {
        showNotice(kNothingToFreeze);
        return;
    }
    if (look == Look::Earlier && (!wasLive || _newest))
        _freeze.goEarlier();
    else if (look == Look::Later)
        _freeze.goLater();
    for (const auto& pane : _navController->viewControllers())
        pane->reloadWithNode(_freeze.nodeOf(*pane));
    offerMoments();
    updateStatus();
}

void KestrumApp::offerMoments()
{
    _navController->view().setFrozen(FrozenMoment{_freeze.status(), _freeze.hasEarlier(), _freeze.hasLater()});
}

void KestrumApp::returnToLive()
{
    _freeze.end();
    _navController->view().setFrozen(std::nullopt);
    if (std::exchange(_replacedWhileFrozen, false))
        closePanes();
    if (_newest)
        reloadPanes();
    updateStatus();
}

void KestrumApp::updateStatus()
{
    if (!_navController)
        return;
    updateStatusForViewController(_navController->topViewController());
    _sheets->show(_freeze.isOn()  ? _freeze.status()
                  : isConnected() ? updateMessage().value_or("")
                                  : std::string(kConnecting));
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
    _newest = nullptr;
    if (_freeze.isOn())
        _replacedWhileFrozen = true;
    else
        closePanes();
}

void KestrumApp::closePanes()
{
    _sheets->close();
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
    if (const auto model = std::exchange(_model, nullptr)) {
        model->setObserver(nullptr);
        model->setWatch(nullptr);
    }
}

bool KestrumApp::offers(SheetKind kind, std::optional<std::size_t> row) const
{
    return _model && _sheets->offers(kind, _model->technology(), _navController->topViewController(), row);
}

void KestrumApp::sheetRequested(SheetKind kind, std::optional<std::size_t> row)
{
    _sheets->open(kind, shown(), _navController->topViewController(), row);
    updateStatus();
}

Shown KestrumApp::shown() const
{
    return {_model->technology(), _navController->viewControllers().front()->node(),
            _freeze.isOn() ? _freeze.moment() : _history.moments().newest()};
}

void KestrumApp::willShowViewController(NavigationStack&, KestrumPaneController& viewController, bool)
{
    updateStatusForViewController(viewController);
}

} // namespace kestrum
