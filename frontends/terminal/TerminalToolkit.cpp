#include "frontends/terminal/TerminalToolkit.h"

#include "frontends/terminal/Box.h"
#include "frontends/terminal/Cells.h"
#include "frontends/terminal/Navigation.h"
#include "frontends/terminal/Repaint.h"
#include "frontends/terminal/SaveScreen.h"
#include "frontends/terminal/Screen.h"
#include "platform/posix/SignalPipe.h"

#include <QCoreApplication>
#include <QSocketNotifier>
#include <QTimer>

#include <algorithm>
#include <array>
#include <chrono>
#include <csignal>
#include <deque>
#include <unistd.h>
#include <vector>

namespace kestrum::terminal {

namespace {

using namespace std::chrono_literals;

constexpr std::array<std::string_view, 10> kSpinner = {"⠋", "⠙", "⠹", "⠸", "⠼", "⠴", "⠦", "⠧", "⠇", "⠏"};
constexpr auto kSpinnerTurn = 120ms;

struct Alert {
    std::string title, message, button;
};

void drawAlert(Screen& screen, const Alert& alert)
{
    const std::string button = "[ " + alert.button + " ]";
    const Area inside = drawBox(screen, 5, std::max({columns(alert.title), columns(alert.message), columns(button)}));
    const auto line = [&](int row) { return Line(screen, inside.row + row, inside.column, inside.columns); };
    line(0).put(0, alert.title, {.bold = true, .colour = Colour::Danger});
    line(2).put(0, alert.message);
    line(4).putRight(button, {.reverse = true});
    screen.placeCursor(inside.row + 4, inside.column + inside.columns - columns(button), false);
}

} // namespace

/// Screen, input and main loop.
struct TerminalToolkit::Parts final : Repaint {
    explicit Parts(Charset charset) : screen(charset)
    {
        repaint.setSingleShot(true);
        QObject::connect(&repaint, &QTimer::timeout, [this] { draw(); });
        QObject::connect(&turn, &QTimer::timeout, [this] {
            spinnerPicture = (spinnerPicture + 1) % kSpinner.size();
            draw();
        });
    }

    void repaintLater() override
    {
        if (!repaint.isActive())
            repaint.start(0ms);
    }

    void draw()
    {
        if (!screen.isOpen() || !root)
            return;
        compose();
        screen.show();
        if (root->isSpinning() != turn.isActive())
            root->isSpinning() ? turn.start(kSpinnerTurn) : turn.stop();
    }

    void compose()
    {
        root->draw(screen, kSpinner[spinnerPicture], !alerts.empty());
        if (!alerts.empty()) {
            screen.setDimmed(false);
            drawAlert(screen, alerts.front());
        }
    }

    void readInput()
    {
        if (screen.hungUp())
            return end();
        while (const auto input = screen.read()) {
            if (!root)
                continue;
            // Several keys can arrive together: each one acts on the screen that the previous one has shown.
            if (repaint.isActive())
                compose();
            if (!alerts.empty())
                handleAlert(*input);
            else
                root->handle(*input);
        }
        repaintLater();
    }

    void handleAlert(const Input& input)
    {
        if (input.key != Key::Enter && input.key != Key::Escape && input.key != Key::Press && !input.is(L' '))
            return;
        alerts.pop_front();
        repaintLater();
    }

    void takeSignals()
    {
        // Ending signals come first: a stopped job is killed by SIGTERM and SIGCONT together.
        for (const int each : signals->taken())
            switch (each) {
            case SIGTSTP:
                stop();
                break;
            case SIGCONT:
                goOn();
                break;
            case SIGWINCH:
                screen.resize();
                repaintLater();
                break;
            default:
                return end();
            }
    }

    void stop()
    {
        screen.suspend();
        raise(SIGSTOP);
    }

    void goOn()
    {
        // Continued in the background, while the shell owns the terminal: wait for the foreground.
        if (tcgetpgrp(STDIN_FILENO) != getpgrp())
            return stop();
        screen.resume();
        repaintLater();
    }

    void end()
    {
        input.reset(); // a closed terminal would stay readable
        ended = true;
        QCoreApplication::quit();
    }

    Screen screen;
    TerminalNavigationView* root = nullptr;
    std::deque<Alert> alerts;
    QTimer repaint, turn;
    std::size_t spinnerPicture = 0;
    std::optional<SignalPipe> signals;
    std::unique_ptr<QSocketNotifier> input, signalled;
    bool ended = false;
};

namespace {

/// The screen as the application's window.
class TerminalWindow final : public Window {
public:
    TerminalWindow(Screen& screen, TerminalNavigationView*& root, Repaint& repaint)
        : _screen(screen), _root(root), _repaint(repaint)
    {}
    ~TerminalWindow() override { orderOut(); }

    void setRoot(NavigationView& root) override { _root = static_cast<TerminalNavigationView*>(&root); }
    void makeKeyAndVisible() override
    {
        _screen.open();
        _repaint.repaintLater();
    }
    void orderOut() override
    {
        _screen.close();
        _root = nullptr;
    }

private:
    Screen& _screen;
    TerminalNavigationView*& _root;
    Repaint& _repaint;
};

} // namespace

TerminalToolkit::TerminalToolkit(Charset charset) : _parts(std::make_unique<Parts>(charset)) {}

TerminalToolkit::~TerminalToolkit() = default;

std::optional<Problem> TerminalToolkit::problem()
{
    return Screen::problem();
}

Rect TerminalToolkit::mainScreenBounds() const
{
    return {0, 0, _parts->screen.columns() * kPointsPerColumn, _parts->screen.rows() * kPointsPerLine};
}

Rect TerminalToolkit::mainScreenApplicationFrame() const
{
    return mainScreenBounds(); // a terminal has no status bar
}

Size TerminalToolkit::measure(std::string_view text, Font) const
{
    return {columns(text) * kPointsPerColumn, kPointsPerLine};
}

std::unique_ptr<Window> TerminalToolkit::makeWindow(Rect)
{
    return std::make_unique<TerminalWindow>(_parts->screen, _parts->root, *_parts);
}

std::unique_ptr<NavigationView> TerminalToolkit::makeNavigationView(NavigationViewDelegate& delegate)
{
    return std::make_unique<TerminalNavigationView>(delegate, *_parts, [this] { _parts->end(); });
}

std::unique_ptr<TableScreen> TerminalToolkit::makeTableScreen(TableDataSource& source)
{
    return std::make_unique<TerminalTableScreen>(source, *_parts);
}

std::unique_ptr<SaveInterface> TerminalToolkit::loadSaveInterface(SaveInterfaceOwner& owner)
{
    return std::make_unique<TerminalSaveInterface>(owner, *_parts);
}

std::shared_ptr<Label> TerminalToolkit::makeLabel()
{
    return std::make_shared<TerminalLabel>();
}

std::shared_ptr<ScrollView> TerminalToolkit::makeScrollView()
{
    return std::make_shared<TerminalScrollView>();
}

void TerminalToolkit::showAlert(std::string_view title, std::string_view message, std::string_view button)
{
    _parts->alerts.push_back({std::string(title), std::string(message), std::string(button)});
    _parts->repaintLater();
}

int TerminalToolkit::run(ApplicationDelegate& application)
{
    auto& parts = *_parts;
    // Before the terminal library, which checks which signals already have a handler.
    parts.signals.emplace(std::vector{SIGTERM, SIGHUP, SIGINT, SIGQUIT, SIGTSTP, SIGCONT, SIGWINCH});
    // A process in the background must not be stopped when it restores the terminal.
    std::signal(SIGTTOU, SIG_IGN);
    parts.signalled = std::make_unique<QSocketNotifier>(parts.signals->descriptor(), QSocketNotifier::Read);
    QObject::connect(parts.signalled.get(), &QSocketNotifier::activated, [&parts] { parts.takeSignals(); });
    parts.input = std::make_unique<QSocketNotifier>(STDIN_FILENO, QSocketNotifier::Read);
    QObject::connect(parts.input.get(), &QSocketNotifier::activated, [&parts] { parts.readInput(); });

    application.applicationDidFinishLaunching();
    const int status = parts.ended ? 0 : QCoreApplication::exec();
    application.applicationWillTerminate();

    parts.screen.close();
    parts.input.reset();
    parts.signalled.reset();
    parts.signals.reset();
    std::signal(SIGTTOU, SIG_DFL);
    return status;
}

} // namespace kestrum::terminal
