#include "QtTest.h"

#include "platform/ApplicationDelegate.h"

#include <QTimer>

#include <csignal>
#include <cstdio>
#include <cstdlib>

namespace kestrum {
namespace {

/// Ends the main loop in a given way after its start.
struct Ending {
    const char* name;
    std::function<void(Window&)> end;
    friend void PrintTo(const Ending& shown, std::ostream* out) { *out << shown.name; }
};

struct Application : ApplicationDelegate {
    explicit Application(const Ending& way) : ending(way) {}

    void applicationDidFinishLaunching() override
    {
        window = toolkit().makeWindow(toolkit().mainScreenBounds());
        window->makeKeyAndVisible();
        QTimer::singleShot(0, [this] { ending.end(*window); });
    }
    void applicationWillTerminate() override
    {
        ++terminations;
        window->orderOut();
    }

    const Ending& ending;
    std::unique_ptr<Window> window;
    int terminations = 0;
};

class TheEnd : public testing::TestWithParam<Ending> {};

TEST_P(TheEnd, ReachesTheApplicationExactlyOnce)
{
    Application application(GetParam());
    EXPECT_EQ(toolkit().run(application), 0);
    EXPECT_EQ(application.terminations, 1);
}

QWidget& widgetOf(Window& window)
{
    return static_cast<qt::MainWindow&>(window);
}

INSTANTIATE_TEST_SUITE_P(Run, TheEnd,
                         testing::Values(Ending{"ByClosingTheWindow", [](Window& window) { widgetOf(window).close(); }},
                                         Ending{"BySigterm", [](Window&) { std::raise(SIGTERM); }},
                                         Ending{"BySigint", [](Window&) { std::raise(SIGINT); }},
                                         Ending{"BySighup", [](Window&) { std::raise(SIGHUP); }},
                                         Ending{"BySeveralSignalsAtOnce",
                                                [](Window& window) {
                                                    std::raise(SIGTERM);
                                                    std::raise(SIGHUP);
                                                    widgetOf(window).close();
                                                    std::raise(SIGINT);
                                                }},
                                         Ending{"InsideAWait",
                                                [](Window&) {
                                                    QEventLoop wait;
                                                    QTimer::singleShot(0, [] { std::raise(SIGTERM); });
                                                    wait.exec();
                                                }}),
                         [](const auto& each) { return std::string(each.param.name); });

/// As Qt does when the display server ends. A death test runs first, before the program has threads.
TEST(TheEndByExitDeathTest, ReachesTheApplicationExactlyOnce)
{
    const Ending exits{"ByExit", [](Window&) { std::exit(1); }};
    struct Telling final : Application {
        using Application::Application;
        void applicationWillTerminate() override
        {
            Application::applicationWillTerminate();
            std::fprintf(stderr, "told %d times;", terminations);
        }
    } application(exits);
    EXPECT_EXIT(toolkit().run(application), testing::ExitedWithCode(1), "^told 1 times;$");
}

TEST(TheScreen, HasAHandsetsShapeOnADesktop)
{
    const Rect bounds = toolkit().mainScreenBounds();
    EXPECT_EQ(bounds.width, 390);
    EXPECT_LE(bounds.height, 844);
    EXPECT_EQ(toolkit().mainScreenApplicationFrame(), bounds);
}

} // namespace
} // namespace kestrum
