#include "capture/CaptureWriter.h"
#include "frontends/qt/MainWindow.h"
#include "harness/FileContents.h"
#include "harness/Places.h"
#include "harness/QtTestToolkit.h"
#include "harness/Scratch.h"
#include "platform/qt/LinuxDevice.h"
#include "terminal/Demonstration.h"
#include "terminal/Pseudoterminal.h"
#include "ui/KestrumApp.h"

#include <QAbstractEventDispatcher>
#include <QApplication>
#include <QKeyEvent>
#include <QProcess>
#include <gmock/gmock.h>

#include <algorithm>
#include <cctype>
#include <csignal>
#include <filesystem>
#include <fstream>
#include <optional>
#include <regex>
#include <set>
#include <stdexcept>
#include <unistd.h>

// Both front ends, each with a separate faulty service.
namespace kestrum {
namespace {

using testing::ElementsAre, testing::MatchesRegex;

/// voxd on a separate device.
class Service {
public:
    explicit Service(const QStringList& scenario) : _scenario(scenario)
    {
        for (const char* each : {"run", "device"})
            std::filesystem::create_directories(directory / each);
        std::filesystem::permissions(directory / "run", std::filesystem::perms::owner_all);
        std::ofstream capture(directory / "beats.kcap", std::ios::binary);
        for (int beat = 0; beat < 5000; ++beat)
            writeKcap(sinkTo(capture),
                      bytesOf(propertyList(text("_sorted", "_sorted") +
                                           dictionary("0;Serving Cell", text("PCI", "101") + text("RSRP", "-97")) +
                                           text("1;Beat", std::to_string(beat)) + text("2;State", "camped") +
                                           text("3;Band", "7"))));
        capture.close();
        serve({});
    }
    ~Service() { stop(); }

    std::map<std::string, std::string> environment() const
    {
        return {{"KESTRUM_RUNTIME_DIR", directory / "run"},
                {"KESTRUM_DEVICE_ROOT", directory / "device"},
                {"XDG_CONFIG_HOME", directory / "config"}};
    }
    /// Waits until the restarted service accepts clients.
    void serve(const QStringList& options)
    {
        stop();
        _log.clear();
        const QStringList beats{"--replay", QString::fromStdString(directory / "beats.kcap")};
        auto environment = QProcessEnvironment::systemEnvironment();
        for (const auto& [name, value] : this->environment())
            environment.insert(QString::fromStdString(name), QString::fromStdString(value));
        _process.setProcessEnvironment(environment);
        _process.start(QString::fromStdString(builtProgram("voxd")),
                       (_scenario.isEmpty() ? beats : _scenario) + options);
        while (!_process.canReadLine())
            if (!_process.waitForReadyRead())
                throw std::runtime_error("voxd does not serve");
    }
    void stop()
    {
        _process.kill();
        _process.waitForFinished();
    }
    bool told(std::string_view text)
    {
        _log += _process.readAllStandardError().toStdString();
        return _log.find(text) != std::string::npos;
    }
    const std::string& log() const { return _log; }
    bool isGone() const { return _process.state() == QProcess::NotRunning; }
    bool isStopped() const
    {
        const auto state = contentsOf("/proc/" + std::to_string(_process.processId()) + "/stat");
        return state.find(") T ") != std::string::npos;
    }
    void resume() { ::kill(static_cast<pid_t>(_process.processId()), SIGCONT); }

    ScratchDirectory directory;

private:
    QStringList _scenario; ///< used in place of the beats
    QProcess _process;
    std::string _log;
};

std::string keyOf(const std::string& row)
{
    return row.substr(0, row.find(", "));
}

/// A front end as a user sees it.
class Display {
public:
    virtual ~Display() = default;
    virtual std::vector<std::string> rows() = 0; ///< "Key" or "Key, value"
    virtual std::string status() = 0;
    virtual std::string chosen() = 0; ///< the chosen row's key
    virtual void pressDown() = 0;
    /// Whether it has answered the key by choosing another row. Asked at each turn of the main loop until it has.
    virtual bool answered() = 0;
    /// The amount of other work before it answered the key, in a measure that depends on the front end.
    virtual int doneBeforeAnswer() const = 0;
    virtual int mostDoneBeforeAnswer() const = 0;
    virtual pid_t process() const = 0;

    /// Bytes of resident memory.
    std::size_t memory() const
    {
        std::ifstream file("/proc/" + std::to_string(process()) + "/statm");
        std::size_t total = 0, resident = 0;
        file >> total >> resident;
        return resident * static_cast<std::size_t>(::sysconf(_SC_PAGESIZE));
    }
};

class TerminalDisplay final : public Display {
public:
    explicit TerminalDisplay(const std::map<std::string, std::string>& environment)
    {
        terminal.start("kestrum-terminal", {}, environment);
    }

    std::vector<std::string> rows() override
    {
        std::vector<std::string> rows;
        for (int i = 1; i < 23; ++i)
            if (auto row = asSpoken(terminal.row(i)); !row.empty())
                rows.push_back(std::move(row));
        return rows;
    }
    std::string status() override
    {
        std::smatch found;
        const auto line = terminal.row(23);
        return std::regex_search(line, found, std::regex("Updated [-0-9a-z: ]*[0-9]")) ? found.str() : "";
    }
    std::string chosen() override { return keyOf(asSpoken(terminal.chosen())); }
    void pressDown() override
    {
        _chosen = chosen();
        _status = status();
        _refreshes = 0;
        terminal.press(Pseudoterminal::Key::Down);
    }
    bool answered() override
    {
        if (chosen() != _chosen)
            return true;
        if (const auto now = status(); now != std::exchange(_status, now))
            ++_refreshes;
        return false;
    }
    int doneBeforeAnswer() const override { return _refreshes; }
    int mostDoneBeforeAnswer() const override { return 1; }
    pid_t process() const override { return terminal.process(); }

    Pseudoterminal terminal{24, 80};

private:
    static std::string asSpoken(const std::string& row)
    {
        return std::regex_replace(std::regex_replace(row, std::regex("^ +| +›? *$"), ""), std::regex("  +"), ", ");
    }

    std::string _chosen, _status; ///< at the time of the key press
    int _refreshes = 0;           ///< shown since the key press
};

/// The application in this process.
class WindowDisplay final : public Display {
public:
    WindowDisplay()
    {
        _application->applicationDidFinishLaunching();
        for (auto* each : QApplication::topLevelWidgets())
            if (auto* window = dynamic_cast<qt::MainWindow*>(each))
                _window = window;
    }
    ~WindowDisplay() override
    {
        _application->applicationWillTerminate();
        _device.dropQueued();
    }

    std::vector<std::string> rows() override
    {
        std::vector<std::string> rows;
        for (const auto* cell : table().cellsInView())
            rows.push_back(cell->spoken().toStdString());
        return rows;
    }
    std::string status() override
    {
        const auto status = _window->root()->toolbar()->widgetAt(1)->accessibleName().toStdString();
        return status.starts_with("Updated ") ? status : "";
    }
    std::string chosen() override
    {
        const auto row = table().current();
        const auto* cell = row ? table().cellAt(*row) : nullptr;
        return cell != nullptr ? keyOf(cell->spoken().toStdString()) : "";
    }
    void pressDown() override
    {
        _chosen = chosen();
        _turns = 0;
        // Posted to the queue, as a user's key is.
        QApplication::postEvent(&table(), new QKeyEvent(QEvent::KeyPress, Qt::Key_Down, Qt::NoModifier));
    }
    bool answered() override
    {
        if (chosen() != _chosen)
            return true;
        ++_turns;
        return false;
    }
    int doneBeforeAnswer() const override { return _turns; }
    int mostDoneBeforeAnswer() const override { return 3; }
    pid_t process() const override { return ::getpid(); }

private:
    qt::Table& table() { return *_window->root()->table(); }

    LinuxDevice _device{"kestrum", LinuxDevice::Output::Quiet};
    ApplicationRoles _roles = _device.applicationRoles(toolkit());
    std::shared_ptr<KestrumApp> _application = KestrumApp::make(_roles);
    qt::MainWindow* _window = nullptr;
    std::string _chosen; ///< at the time of the key press
    int _turns = 0;      ///< of the main loop since the key press, nested loops included
};

constexpr std::size_t kMegabyte = 1 << 20;
// A beat comes every 10 ms from then on, every 500 ms before. So no display is that far when a fault begins.
constexpr const char* kFast = "50";
constexpr int kBeatAfterFaults = 100;

struct Fault {
    const char* names;
    std::size_t memory = 24 * kMegabyte; ///< the memory that a display may use because of the fault
    const char* scenario = "";           ///< used in place of the beats

    friend void PrintTo(const Fault& shown, std::ostream* out) { *out << shown.names; }
};

class Faults : public testing::TestWithParam<Fault> {
protected:
    struct Side {
        Side(Service& service, Display& display) : service(service), display(display) {}

        /// From now on, presses a key when this fault occurs.
        void awaitFault(std::string name)
        {
            fault = std::move(name);
            pressed = false;
            runningAtAnswer.reset();
        }
        // Checked at each turn of the main loop: a later check might be after the fault.
        void look()
        {
            if (fault.empty() || runningAtAnswer)
                return;
            if (pressed && display.answered())
                runningAtAnswer = isRunning();
            // Its last line before a signal may stay in its buffer.
            if (!pressed && (service.told("fault " + fault + ": now") || service.isStopped() || service.isGone())) {
                pressed = true;
                display.pressDown();
            }
        }
        /// Whether the fault still lasts. A fault that occurs once ends immediately.
        bool isRunning()
        {
            static const std::set<std::string> once{"half-frame", "garbage", "oversized"};
            return service.isStopped() || service.isGone() || once.contains(fault) ||
                   !service.told("fault " + fault + ": over");
        }

        Service& service;
        Display& display;
        std::size_t before = 0, peak = 0; ///< memory
        std::string last;                 ///< the last rows seen
        std::string fault;
        bool pressed = false;
        std::optional<bool> runningAtAnswer; ///< whether the fault lasted when the key was answered
    };

    Faults()
    {
        _turns = QObject::connect(QAbstractEventDispatcher::instance(), &QAbstractEventDispatcher::awake, [this] {
            terminal.terminal.takeInTheRest();
            for (auto& side : sides)
                side.look();
        });
    }
    ~Faults() override { QObject::disconnect(_turns); }

    /// Runs both displays until the condition is true for both.
    bool both(const std::function<bool(Side&)>& condition)
    {
        const auto holds = [&] {
            QCoreApplication::processEvents(QEventLoop::AllEvents, 20); // ms, as long as the terminal's part
            for (auto& side : sides)
                side.peak = std::max(side.peak, side.display.memory());
            return std::ranges::all_of(sides, condition);
        };
        for (int patience = 0; patience < 3; ++patience) // the terminal's waits
            if (terminal.terminal.waitUntil(holds))
                return true;
        return false;
    }
    std::string shown()
    {
        std::string all;
        for (auto& side : sides)
            all += "service:\n" + side.service.log() + "display:\n" + testing::PrintToString(side.display.rows()) +
                   side.display.status() + "\n";
        return all;
    }

    static bool isScenario() { return *GetParam().scenario != '\0'; }
    static QStringList scenario()
    {
        return isScenario() ? QStringList{"--scenario", GetParam().scenario} : QStringList();
    }
    /// The beat that the rows show, if they show exactly what the service has sent.
    static std::optional<int> beat(Display& display)
    {
        static const std::string key = "Beat, ";
        const auto rows = display.rows();
        const testing::Matcher<std::vector<std::string>> sound =
            ElementsAre("Serving Cell", MatchesRegex(key + "[0-9]+"), "State, camped", "Band, 7");
        return sound.Matches(rows) ? std::optional(std::stoi(rows[1].substr(key.size()))) : std::nullopt;
    }
    static bool showsData(Display& display)
    {
        return isScenario() ? !display.status().empty() && !display.rows().empty() : beat(display).has_value();
    }

    Service ofTerminal{scenario()}, ofWindow{scenario()};
    ScopedVariable runtimeVariable{"KESTRUM_RUNTIME_DIR", ofWindow.directory / "run"};
    ScopedVariable deviceVariable{"KESTRUM_DEVICE_ROOT", ofWindow.directory / "device"};
    ScopedVariable configurationVariable{"XDG_CONFIG_HOME", ofWindow.directory / "config"};
    TerminalDisplay terminal{ofTerminal.environment()};
    WindowDisplay window;
    std::vector<Side> sides{{ofTerminal, terminal}, {ofWindow, window}};

private:
    QMetaObject::Connection _turns;
};

// Independent of timing: the test waits for what a display finally shows.
TEST_P(Faults, LeaveTheDisplayAnsweringSmallAndShowingWhatComesNext)
{
    ASSERT_TRUE(both([](Side& side) { return showsData(side.display); })) << shown();
    for (auto& side : sides)
        side.before = std::exchange(side.peak, 0);

    for (auto& side : sides)
        side.service.serve({"--speed", kFast, "--fault", GetParam().names});
    const QStringList faults = QString(GetParam().names).split(',');
    for (const auto& each : faults) {
        for (auto& side : sides)
            side.awaitFault(each.toStdString());
        ASSERT_TRUE(both([](Side& side) { return side.runningAtAnswer.has_value(); })) << shown();
        for (auto& side : sides) {
            EXPECT_TRUE(*side.runningAtAnswer) << shown();
            EXPECT_LE(side.display.doneBeforeAnswer(), side.display.mostDoneBeforeAnswer()) << shown();
        }
    }
    const auto fault = faults.last().toStdString();

    if (fault == "stop") {
        ASSERT_TRUE(both([](Side& side) { return side.service.isStopped(); })) << shown();
        for (auto& side : sides)
            side.service.resume();
    }
    if (fault == "die") {
        ASSERT_TRUE(both([](Side& side) { return side.service.isGone(); })) << shown();
        for (auto& side : sides)
            side.service.serve({"--speed", kFast});
    } else {
        ASSERT_TRUE(both([&](Side& side) { return side.service.told("fault " + fault + ": over"); })) << shown();
    }
    if (isScenario()) {
        for (int update = 0; update < 2; ++update) { // the first update may still show earlier data
            for (auto& side : sides)
                side.last = side.display.status();
            EXPECT_TRUE(both([](Side& side) { return showsData(side.display) && side.display.status() != side.last; }))
                << shown();
        }
    } else {
        EXPECT_TRUE(both([](Side& side) { return beat(side.display) >= kBeatAfterFaults; })) << shown();
    }
    for (auto& side : sides)
        EXPECT_LT(side.peak, side.before + GetParam().memory) << "from " << side.before;
}

INSTANTIATE_TEST_SUITE_P(OfTheService, Faults,
                         testing::Values(Fault{"reply-never"}, Fault{"reply-1100ms"}, Fault{"wrong-ids"},
                                         Fault{"technology"}, Fault{"notifications"},
                                         Fault{"half-frame,garbage,oversized"}, Fault{"reply-900ms"},
                                         Fault{"flood", 340 * kMegabyte, "lte"}, Fault{"byte-by-byte"}, Fault{"stop"},
                                         Fault{"die"}),
                         [](const auto& each) {
                             std::string name = each.param.names;
                             std::erase_if(name, [](unsigned char letter) { return std::isalnum(letter) == 0; });
                             return name;
                         });

} // namespace
} // namespace kestrum
