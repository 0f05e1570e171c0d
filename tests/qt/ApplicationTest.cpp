#include "QtTest.h"

#include "core/KestrumModelNode.h"
#include "doubles/MemoryFileSystem.h"
#include "doubles/RecordingPreferences.h"
#include "frontends/qt/Motion.h"
#include "harness/Scratch.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "ui/KestrumApp.h"
#include "ui/ServedModem.h"

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

/// The application in a real window with real files. The service and the clock are doubles.
class TheApplicationInItsWindow : public testing::Test {
protected:
    TheApplicationInItsWindow()
    {
        qt::setMotionWanted(false);
        qt::FocusRing::instance().setShown(false);
        _files.paths.insert(kInternalInstall);
        _files.logDirectory = directory.path();
    }
    ~TheApplicationInItsWindow() override
    {
        _application->applicationWillTerminate();
        doubles.queue.drop();
        qt::setMotionWanted(true);
    }

    void launch()
    {
        _application->applicationDidFinishLaunching();
        doubles.queue.run();
        for (auto* each : QApplication::topLevelWidgets())
            if (auto* window = dynamic_cast<qt::MainWindow*>(each))
                _window = window;
        ASSERT_NE(_window, nullptr);
        ASSERT_TRUE(QTest::qWaitForWindowActive(_window));
    }
    void show(const Value& display) { ASSERT_TRUE(modem.show(display)); }

    qt::Navigation& navigation() { return *_window->root(); }
    std::string title() { return navigation().titleBar().title().toStdString(); }
    std::vector<std::string> rows()
    {
        std::vector<std::string> rows;
        for (const auto* cell : navigation().table()->cellsInView())
            rows.push_back(cell->spoken().toStdString());
        return rows;
    }
    void key(Qt::Key key, Qt::KeyboardModifiers modifiers = {})
    {
        QTest::keyClick(QApplication::focusWidget(), key, modifiers);
    }
    void open(const char* name)
    {
        key(Qt::Key_Slash);
        QTest::keyClicks(QApplication::focusWidget(), name);
        key(Qt::Key_Return);
        key(Qt::Key_Return);
        ASSERT_EQ(title(), name);
    }
    void openSaveScreen()
    {
        key(Qt::Key_S, Qt::ControlModifier);
        ASSERT_NE(navigation().sheet(), nullptr);
    }
    /// The contents of the only saved file.
    Value saveAndRead()
    {
        key(Qt::Key_S, Qt::ControlModifier);
        doubles.queue.run();
        EXPECT_EQ(navigation().sheet(), nullptr);
        std::vector<std::string> names;
        for (const auto& each : std::filesystem::directory_iterator(directory.path()))
            names.push_back(each.path().filename());
        EXPECT_THAT(names, ElementsAre("KestrumSnapshot-1794809142.kestrum"));
        return names.size() == 1 ? _codec.load(directory / names[0]) : Value();
    }

    ScratchDirectory directory;
    MonitorDoubles doubles;

private:
    PropertyListCodec _codec;

protected:
    ServedModem modem{doubles, _codec};

private:
    RecordingPreferences _preferences;
    MemoryFileSystem _files;
    ApplicationRoles _roles{{{doubles.log, doubles.console, doubles.clock, doubles.bundle, _codec, nullptr},
                             doubles.queue,
                             doubles.ports,
                             doubles.telephony},
                            _preferences,
                            _files,
                            toolkit()};
    std::shared_ptr<KestrumApp> _application = KestrumApp::make(_roles);
    qt::MainWindow* _window = nullptr;
};

TEST_F(TheApplicationInItsWindow, ReturnsToTheRootUnderTheSheetWhenAMiddlePaneIsGone)
{
    modem.serve();
    launch();
    show(makeDictionary({{"Serving", ServedModem::cell("-80 dBm")}, {"Neighbour", ServedModem::cell("-95 dBm")}}));
    open("Serving");
    open("Band");
    openSaveScreen();
    show(makeDictionary({{"Other", ServedModem::cell("-70 dBm")}, {"Neighbour", ServedModem::cell("-94 dBm")}}));
    EXPECT_EQ(title(), "Kestrum");
    EXPECT_THAT(rows(), ElementsAre("Other", "Neighbour"));
    ASSERT_NE(navigation().sheet(), nullptr);
    EXPECT_TRUE(navigation().sheet()->description().hasFocus());
    const auto* under = QApplication::widgetAt(navigation().mapToGlobal(QPoint(360, navigation().height() - 24)));
    EXPECT_TRUE(navigation().sheet()->isAncestorOf(under));

    key(Qt::Key_Escape);
    doubles.queue.run();
    EXPECT_EQ(navigation().sheet(), nullptr);
    open("Other");
}

TEST_F(TheApplicationInItsWindow, SavesAnEmptyHistory)
{
    modem.serve();
    launch();
    openSaveScreen();
    EXPECT_TRUE(navigation().sheet()->table().cellsInView().empty());
    QTest::keyClicks(QApplication::focusWidget(), "roof");
    EXPECT_EQ(saveAndRead(),
              Value(makeDictionary(
                  {{"Timestamp", "2026-11-16 06:05:42 +0000"}, {"Data", makeArray({})}, {"Description", "roof"}})));
}

TEST_F(TheApplicationInItsWindow, SavesTheTimeAloneWithoutAGenerator)
{
    launch();
    openSaveScreen();
    EXPECT_TRUE(navigation().sheet()->table().cellsInView().empty());
    EXPECT_EQ(saveAndRead(), Value(makeDictionary({{"Timestamp", "2026-11-16 06:05:42 +0000"}})));
}

} // namespace
} // namespace kestrum
