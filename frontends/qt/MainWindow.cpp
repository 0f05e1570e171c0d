#include "frontends/qt/MainWindow.h"

#include "frontends/qt/Icon.h"
#include "frontends/qt/Measures.h"
#include "frontends/qt/Shortcuts.h"
#include "frontends/qt/Type.h"

#include <QGuiApplication>
#include <QInputDevice>
#include <QScreen>
#include <QTimer>
#include <QWindow>
#include <algorithm>

namespace kestrum::qt {

namespace {

double shortSide(const QSizeF& size)
{
    return std::min(size.width(), size.height());
}

/// Whether a screen's physical size is plausible. Some screens report their aspect ratio instead, in centimetres or
/// millimetres; others report nothing.
bool isSize(const QSizeF& millimetres)
{
    const QSize whole = millimetres.toSize();
    static const QList<QSize> ratios{{160, 90}, {160, 100}, {16, 9}, {16, 10}};
    return shortSide(millimetres) > 0 && !ratios.contains(whole) && !ratios.contains(whole.transposed());
}

Display primaryDisplay()
{
    // These platforms draw directly on the screen, without a desktop.
    static const QStringList bare{QStringLiteral("eglfs"), QStringLiteral("linuxfb"), QStringLiteral("vkkhrdisplay")};
    const QScreen& screen = *QGuiApplication::primaryScreen();
    const auto devices = QInputDevice::devices();
    const bool touch = std::any_of(devices.begin(), devices.end(), [](const QInputDevice* each) {
        return each->type() == QInputDevice::DeviceType::TouchScreen;
    });
    return {screen.size(), screen.physicalSize(), touch, bare.contains(QGuiApplication::platformName())};
}

} // namespace

bool isHandset(const Display& display)
{
    if (display.bare)
        return true;
    if (isSize(display.millimetres))
        return shortSide(display.millimetres) < kHandsetMillimetres;
    return display.touch && shortSide(display.points) < kHandset;
}

bool isHandset()
{
    return isHandset(primaryDisplay());
}

QRect screenArea()
{
    const QScreen& screen = *QGuiApplication::primaryScreen();
    if (isHandset())
        return screen.geometry();
    constexpr int kWindowFrame = 40; // the most that a desktop's frame adds to a window
    const QRect room = screen.availableGeometry();
    const QSize size = QSize(kPhoneWidth, kPhoneHeight).boundedTo(room.size() - QSize(0, kWindowFrame));
    return {room.center() - QPoint(size.width() / 2, size.height() / 2), size};
}

MainWindow::MainWindow()
{
    setWindowTitle(QStringLiteral("Kestrum"));
    setMinimumSize(280, 320);
    setGeometry(screenArea());
    installShortcuts(*this);
}

MainWindow::~MainWindow()
{
    // The controllers own the navigation view.
    if (_root)
        _root->setParent(nullptr);
}

void MainWindow::setRoot(NavigationView& root)
{
    // This front end creates every navigation view, so the cast is safe.
    _root = static_cast<Navigation*>(&root);
    _root->setParent(this);
    _root->setGeometry(rect());
    setWindowTitle(_root->titleBar().title());
    _root->show();
}

void MainWindow::makeKeyAndVisible()
{
    if (isHandset()) {
        // Without a window manager a full-screen window would keep its previous size.
        setGeometry(screenArea());
        showFullScreen();
        connect(QGuiApplication::primaryScreen(), &QScreen::geometryChanged, this,
                [this](const QRect& turned) { setGeometry(turned); });
    } else {
        show();
    }
    windowHandle()->installEventFilter(this);
    activateWindow();
    if (_root)
        _root->takeFocus();
    showNextAlert();
}

bool MainWindow::eventFilter(QObject* watched, QEvent* event)
{
    // Searching the desktop's icon themes takes a quarter of the start, and the first picture does not need the icon.
    if (event->type() == QEvent::Expose) {
        watched->removeEventFilter(this);
        QTimer::singleShot(0, this, [this] { setWindowIcon(qt::windowIcon()); });
    }
    return QWidget::eventFilter(watched, event);
}

void MainWindow::resizeEvent(QResizeEvent*)
{
    if (_root)
        _root->setGeometry(rect());
    if (_alert)
        _alert->setGeometry(rect());
}

void MainWindow::showAlert(std::string_view title, std::string_view message, std::string_view button)
{
    _messages.push_back({lineOf(title), lineOf(message), lineOf(button)});
    if (isVisible())
        showNextAlert();
}

void MainWindow::showNextAlert()
{
    if (_alert || _messages.empty())
        return;
    const Message next = _messages.front();
    _messages.erase(_messages.begin());
    if (_root)
        _root->setEnabled(false);
    const auto closed = [this] {
        _alert = nullptr;
        if (_root) {
            _root->setEnabled(true);
            _root->takeFocus();
        }
        showNextAlert();
    };
    _alert = new Alert(next.title, next.text, next.button, closed, this);
}

} // namespace kestrum::qt
