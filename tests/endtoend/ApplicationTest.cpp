#include "EndToEnd.h"
#include "frontends/qt/MainWindow.h"
#include "platform/qt/LinuxDevice.h"
#include "ui/KestrumApp.h"

#include <QTest>

#include <algorithm>
#include <vector>

namespace kestrum {
namespace {

using testing::Contains;
using testing::Not;
using testing::StartsWith;

/// The parts of `kestrum`, and a user at its window.
class TheApplication : public EndToEnd {
protected:
    ~TheApplication() override
    {
        if (_application)
            _application->applicationWillTerminate();
        _device.dropQueued();
    }

    void launch()
    {
        _application->applicationDidFinishLaunching();
        for (auto* each : QApplication::topLevelWidgets())
            if (auto* window = dynamic_cast<qt::MainWindow*>(each))
                _window = window;
        ASSERT_NE(_window, nullptr);
    }

    qt::Navigation& navigation() { return *_window->root(); }
    qt::Table& table() { return *navigation().table(); }
    std::string title() { return navigation().titleBar().title().toStdString(); }
    std::string status() { return navigation().toolbar()->widgetAt(1)->accessibleName().toStdString(); }
    bool spins() { return navigation().toolbar()->widgetAt(0)->isVisible(); }

    std::vector<std::string> rows()
    {
        std::vector<std::string> rows;
        for (const auto* cell : table().cellsInView())
            rows.push_back(cell->spoken().toStdString());
        return rows;
    }
    bool rowsMove()
    {
        const auto before = rows();
        return eventually([&] { return !rows().empty() && rows() != before; });
    }

private:
    LinuxDevice _device{"kestrum", LinuxDevice::Output::Quiet};
    ApplicationRoles _roles = _device.applicationRoles(toolkit());
    std::shared_ptr<KestrumApp> _application = KestrumApp::make(_roles);
    qt::MainWindow* _window = nullptr;
};

TEST_F(TheApplication, ShowsTheServicesTreeAndFindsItAgainAfterItDied)
{
    ASSERT_TRUE(startService());
    launch();
    EXPECT_EQ(status(), "Connecting");
    EXPECT_TRUE(spins());

    ASSERT_TRUE(eventually([&] { return !rows().empty(); })) << status();
    EXPECT_THAT(rows(), Contains("Serving Cell"));
    EXPECT_THAT(status(), StartsWith("Updated "));
    EXPECT_FALSE(spins());
    EXPECT_TRUE(rowsMove());

    const auto shown = rows();
    killService();
    ASSERT_TRUE(eventually([&] { return status() == "Connecting..."; }));
    EXPECT_TRUE(spins());
    EXPECT_EQ(rows().size(), shown.size()) << "what was shown last stays";

    ASSERT_TRUE(startService());
    ASSERT_TRUE(eventually([&] { return status() != "Connecting..."; }));
    EXPECT_TRUE(rowsMove());
    EXPECT_THAT(status(), StartsWith("Updated "));
    EXPECT_FALSE(spins());
}

TEST_F(TheApplication, IsDrilledIntoWhileItRefreshes)
{
    ASSERT_TRUE(startService());
    launch();
    ASSERT_TRUE(eventually([&] { return testing::Value(rows(), Contains("Serving Cell")); }));
    const auto shown = rows();
    const auto row = std::find(shown.begin(), shown.end(), "Serving Cell") - shown.begin();
    for (auto i = 0; i <= row; ++i)
        QTest::keyClick(&table(), Qt::Key_Down);
    QTest::keyClick(&table(), Qt::Key_Return);
    EXPECT_EQ(title(), "Serving Cell");
    EXPECT_THAT(status(), StartsWith("Updated "));
    EXPECT_THAT(rows(), Not(Contains("Serving Cell")));
    EXPECT_TRUE(rowsMove());
    EXPECT_EQ(title(), "Serving Cell");
    QTest::keyClick(&table(), Qt::Key_Escape);
    EXPECT_THAT(rows(), Contains("Serving Cell"));
    EXPECT_EQ(table().current(), static_cast<std::size_t>(row));
}

TEST_F(TheApplication, StartsOverWithAnotherTechnologyAndComesBack)
{
    // Half a minute of LTE, then of GSM/UMTS, then LTE again, five times as fast.
    ASSERT_TRUE(startService({"--scenario", "drive", "--seed", "1", "--speed", "5"}));
    launch();
    ASSERT_TRUE(eventually([&] { return testing::Value(rows(), Contains("Idle Mode")); }));
    QTest::keyClick(&table(), Qt::Key_Down);
    QTest::keyClick(&table(), Qt::Key_Return);
    EXPECT_EQ(title(), "Serving Cell");

    // All panes of the LTE display are closed.
    ASSERT_TRUE(eventually([&] { return title() == "Kestrum"; }));
    ASSERT_TRUE(eventually([&] { return testing::Value(rows(), Contains("UMTS")); }));
    EXPECT_THAT(rows(), Not(Contains("Idle Mode")));
    EXPECT_THAT(status(), StartsWith("Updated "));

    ASSERT_TRUE(eventually([&] { return testing::Value(rows(), Contains("Idle Mode")); }));
    EXPECT_THAT(rows(), Not(Contains("UMTS")));
}

} // namespace
} // namespace kestrum
