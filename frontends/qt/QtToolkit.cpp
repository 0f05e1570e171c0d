#include "frontends/qt/QtToolkit.h"

#include "frontends/qt/Accessibility.h"
#include "frontends/qt/Appearance.h"
#include "frontends/qt/FocusRing.h"
#include "frontends/qt/MainWindow.h"
#include "frontends/qt/Type.h"
#include "platform/ApplicationDelegate.h"
#include "platform/qt/TerminationSignals.h"

#include <QApplication>
#include <cstdio>
#include <cstdlib>

namespace kestrum {

namespace {

using namespace kestrum::qt;

/// Qt calls abort() when it cannot reach a display: there is none, it is dead, it refuses us, or Qt has no plug-in
/// for it. Before that Qt always writes a fatal message, so all these cases are handled here.
void onMessageAtStart(QtMsgType type, const QMessageLogContext&, const QString& message)
{
    if (type != QtFatalMsg)
        return; // Qt's own explanation, which has many lines
    Q_UNUSED(message);
    std::fputs("kestrum: no display server can be reached.\n"
               "Start it from a desktop session or on a handset's screen, or set DISPLAY or WAYLAND_DISPLAY to a "
               "running one.\nWithout a display: kestrum-terminal shows the same in a terminal.\n",
               stderr);
    std::fflush(stderr);
    std::_Exit(EXIT_FAILURE);
}

class Application final {
public:
    Application() : _before(qInstallMessageHandler(onMessageAtStart)), _application(_argumentCount, _arguments)
    {
        qInstallMessageHandler(_before);
    }
    QApplication* operator->() { return &_application; }

private:
    // The program has no command line, so Qt does not get one either.
    char _name[8] = "kestrum";
    char* _arguments[2] = {_name, nullptr};
    int _argumentCount = 1;
    QtMessageHandler _before;
    QApplication _application;
};

class QtToolkit;
/// The toolkit whose application does not know of its end yet; null when there is none.
QtToolkit* running = nullptr;

class QtToolkit final : public Toolkit {
public:
    QtToolkit()
    {
        QApplication::setApplicationName(QStringLiteral("kestrum"));
        QApplication::setApplicationDisplayName(QStringLiteral("Kestrum"));
        QGuiApplication::setDesktopFileName(QStringLiteral("kestrum"));
        installAccessibility();
        chooseSansSerif();
        FocusRing::instance();
    }

    Rect mainScreenBounds() const override
    {
        const QSize size = _window ? _window->size() : screenArea().size();
        return {0, 0, static_cast<double>(size.width()), static_cast<double>(size.height())};
    }
    // The window's screen has no status bar.
    Rect mainScreenApplicationFrame() const override { return mainScreenBounds(); }
    Size measure(std::string_view text, Font font) const override { return measured(lineOf(text), fontOf(font)); }

    std::unique_ptr<Window> makeWindow(Rect frame) override
    {
        auto window = std::make_unique<MainWindow>();
        window->resize(rectOf(frame).size().toSize());
        _window = window.get();
        for (const Message& message : std::exchange(_early, {}))
            _window->showAlert(message.title, message.text, message.button);
        return window;
    }
    std::unique_ptr<NavigationView> makeNavigationView(NavigationViewDelegate& delegate) override
    {
        return std::make_unique<Navigation>(delegate);
    }
    std::unique_ptr<TableScreen> makeTableScreen(TableDataSource& source) override
    {
        return std::make_unique<Screen>(source);
    }
    std::unique_ptr<SaveInterface> loadSaveInterface(SaveInterfaceOwner& owner) override
    {
        return std::make_unique<SaveSheet>(owner);
    }
    std::shared_ptr<Label> makeLabel() override { return std::make_shared<TextLabel>(); }
    std::shared_ptr<ScrollView> makeScrollView() override { return std::make_shared<Strip>(); }

    void showAlert(std::string_view title, std::string_view message, std::string_view button) override
    {
        if (_window)
            _window->showAlert(title, message, button);
        else
            _early.push_back({std::string(title), std::string(message), std::string(button)});
    }

    int run(ApplicationDelegate& application) override
    {
        // All exits come back here, also from waits inside the loop: the window's, a signal's.
        const TerminationSignals signals([] { QCoreApplication::exit(EXIT_SUCCESS); });
        // The only exception: Qt calls exit() by itself when the display server goes away.
        [[maybe_unused]] static const int registered = std::atexit([] {
            if (running)
                running->endByExit();
        });
        running = this;
        _delegate = &application;
        application.applicationDidFinishLaunching();
        const int status = QApplication::exec();
        tellTheEnd();
        return status;
    }

private:
    void tellTheEnd()
    {
        running = nullptr;
        std::exchange(_delegate, nullptr)->applicationWillTerminate();
    }
    void endByExit()
    {
        // Qt is no longer complete enough to hide the window.
        if (_window)
            _window->abandon();
        tellTheEnd();
    }

    struct Message {
        std::string title, text, button;
    };

    Application _application;
    Appearance _appearance;
    QPointer<MainWindow> _window;
    ApplicationDelegate* _delegate = nullptr; ///< until the delegate was told of the end
    std::vector<Message> _early;              ///< alerts that came before the window existed
};

} // namespace

std::unique_ptr<Toolkit> makeQtToolkit()
{
    return std::make_unique<QtToolkit>();
}

} // namespace kestrum
