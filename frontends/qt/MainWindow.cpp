#include "frontends/qt/MainWindow.h"

#include "frontends/qt/Measures.h"
#include "frontends/qt/Shortcuts.h"
#include "frontends/qt/Type.h"

#include <QGuiApplication>
#include <QScreen>

namespace kestrum::qt {

bool isHandset()
{
    // These draw on the bare screen, without a desktop.
    static const QStringList bare{QStringLiteral("eglfs"), QStringLiteral("linuxfb"), QStringLiteral("vkkhrdisplay")};
    const QSize screen = QGuiApplication::primaryScreen()->size();
    return std::min(screen.width(), screen.height()) < kHandset || bare.contains(QGuiApplication::platformName());
}

QRect screenArea()
{
    const QScreen& screen = *QGuiApplication::primaryScreen();
    if (isHandset())
        return screen.geometry();
    constexpr int kWindowFrame = 40; // what a desktop adds around a window, at most
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
    // The navigation view belongs to the controllers.
    if (_root)
        _root->setParent(nullptr);
}

void MainWindow::setRoot(NavigationView& root)
{
    // This front end makes every navigation view, so it is one of ours.
    _root = static_cast<Navigation*>(&root);
    _root->setParent(this);
    _root->setGeometry(rect());
    setWindowTitle(_root->titleBar().title());
    _root->show();
}

void MainWindow::makeKeyAndVisible()
{
    if (isHandset()) {
        // Without a window manager a full screen has the size that the window had before.
        setGeometry(screenArea());
        showFullScreen();
        connect(QGuiApplication::primaryScreen(), &QScreen::geometryChanged, this,
                [this](const QRect& turned) { setGeometry(turned); });
    } else {
        show();
    }
    activateWindow();
    if (_root)
        _root->takeFocus();
    showNextAlert();
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
