// The window's own work, with real widgets: a refresh with the pane that it changes, and a scroll through 200 rows.
// Prints lines "name<TAB>figure<TAB>unit". Without a display it draws offscreen.
#include "platform/Window.h"
#include "core/KestrumModelNode.h"
#include "frontends/qt/Navigation.h"
#include "frontends/qt/QtToolkit.h"
#include "platform/Toolkit.h"
#include "scenarios/Drive.h"
#include "ui/KestrumPaneController.h"
#include "ui/NavigationStack.h"
#include "ui/SharedApplication.h"

#include <QApplication>
#include <QWheelEvent>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <string>
#include <vector>

namespace kestrum::bench {
namespace {

class NoApplication final : public SharedApplication {
    bool allowSaveButton() const override { return false; }
    void showSaveView() override {}
    void closeSaveView() override {}
    void showNotice(std::string_view) override {}
};

/// Notices when the window was painted.
class Painted final : public QObject {
public:
    Painted() { qApp->installEventFilter(this); }
    bool eventFilter(QObject*, QEvent* event) override
    {
        happened = happened || event->type() == QEvent::Paint;
        return false;
    }

    bool happened = false;
};

/// The processor time of the calling thread, in milliseconds.
double threadTime()
{
    timespec time{};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
    return static_cast<double>(time.tv_sec) * 1e3 + static_cast<double>(time.tv_nsec) / 1e6;
}

/// A window with a stack of panes.
class Shown {
public:
    explicit Shown(Toolkit& toolkit)
        : _toolkit(toolkit),
          _root(pane(nullptr, std::string(kRootPath))),
          _stack(toolkit, _root),
          _window(toolkit.makeWindow(toolkit.mainScreenBounds()))
    {
        _window->setRoot(_stack.view());
        _window->makeKeyAndVisible();
    }

    std::shared_ptr<KestrumPaneController> pane(KestrumModelNodeRef node, std::string path)
    {
        return std::make_shared<KestrumPaneController>(_toolkit, _application, std::move(node), std::move(path));
    }
    void push(std::shared_ptr<KestrumPaneController> pane) { _stack.pushViewController(std::move(pane), false); }
    KestrumPaneController& root() { return *_root; }
    QWidget& viewport() { return *static_cast<qt::Navigation&>(_stack.view()).table()->viewport(); }

    /// The time that a change takes until it is painted.
    template <typename Change>
    double frame(Change change)
    {
        const double begin = threadTime();
        _painted.happened = false;
        change();
        for (int turn = 0; turn < 100 && !_painted.happened; ++turn)
            QCoreApplication::processEvents();
        if (!_painted.happened) {
            std::fputs("bench_window: a change was not painted\n", stderr);
            std::exit(1);
        }
        return threadTime() - begin;
    }

private:
    Toolkit& _toolkit;
    NoApplication _application;
    Painted _painted;
    std::shared_ptr<KestrumPaneController> _root;
    NavigationStack _stack;
    std::unique_ptr<Window> _window; // borrows the stack's view
};

void print(const std::string& name, const char* what, double milliseconds)
{
    std::printf("%s, %s\t%.2f\tms\n", name.c_str(), what, milliseconds);
}

void print(const std::string& name, std::vector<double> times)
{
    std::ranges::sort(times);
    print(name, "median", times[times.size() / 2]);
    print(name, "worst", times.back());
}

/// The pane with the most values.
struct Widest {
    std::string path;
    std::ptrdiff_t values = -1;

    void find(const KestrumModelNode& node, const std::string& at)
    {
        const auto* rows = node.childNodes();
        if (!rows)
            return;
        const auto found = std::ranges::count_if(*rows, [](const auto& row) { return row->value() != nullptr; });
        if (found > values)
            *this = {at, found};
        for (const auto& row : *rows)
            find(*row, joinPath(at, row->displayName()));
    }
};

void refreshes(Toolkit& toolkit, const Scenario& scenario)
{
    constexpr unsigned kRefreshes = 200;
    Decoding decoding(scenario.technology);
    for (const auto& message : driven(scenario, std::chrono::minutes(1)))
        decoding.receive(message.bytes);
    decoding.fill(0);
    PathDictionary paths;
    Widest widest;
    widest.find(*decoding.refresh(paths), std::string(kRootPath));

    Shown shown(toolkit);
    const auto pane = shown.pane(paths.find(widest.path), widest.path);
    shown.frame([&] { shown.push(pane); });
    std::vector<double> times;
    for (unsigned round = 1; round <= kRefreshes; ++round) {
        decoding.fill(round);
        times.push_back(shown.frame([&] {
            PathDictionary fresh;
            const auto tree = decoding.refresh(fresh);
            shown.root().reloadWithNode(tree);
            pane->reloadWithNode(fresh.find(widest.path));
            paths = std::move(fresh); // frees the tree before it, as the model does
        }));
    }
    print("refresh and pane/" + std::string(scenario.name), std::move(times));
}

void scroll(Toolkit& toolkit)
{
    constexpr int kRows = 200, kTurn = 120; // a mouse wheel's step, in eighths of a degree
    KestrumModelNodes rows;
    for (int i = 0; i < kRows; ++i)
        rows.push_back(std::make_shared<KestrumModelLeafNode>("Neighbour " + std::to_string(i),
                                                              std::to_string(-700 - 7 * i % 500) + " dBm, reported"));
    Shown shown(toolkit);
    shown.frame(
        [&] { shown.root().reloadWithNode(std::make_shared<KestrumModelTreeNode>("Kestrum", std::move(rows))); });
    auto& table = *static_cast<qt::Table*>(shown.viewport().parentWidget());
    std::vector<double> times;
    while (!table.cellAt(kRows - 1))
        times.push_back(shown.frame([&] {
            const QPointF at = shown.viewport().rect().center();
            QWheelEvent turned(at, shown.viewport().mapToGlobal(at), {}, {0, -kTurn}, {}, {}, Qt::NoScrollPhase, false);
            QCoreApplication::sendEvent(&shown.viewport(), &turned);
        }));
    print("scroll through 200 rows, a frame", std::move(times));
}

} // namespace
} // namespace kestrum::bench

int main()
{
    using namespace kestrum;
    setenv("QT_QPA_PLATFORM", "offscreen", 0);
    const auto toolkit = makeQtToolkit();
    for (const Scenario& scenario : scenarios())
        if (scenario.name != "drive") // a mix of the others
            bench::refreshes(*toolkit, scenario);
    bench::scroll(*toolkit);
}
