#include "QtTest.h"

#include "frontends/qt/Motion.h"
#include "frontends/qt/Type.h"

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class ANavigationView : public InAWindow {
protected:
    ANavigationView() : _first(screenOf(firstRows)), _second(screenOf(secondRows))
    {
        navigation().show(*_first, {"Kestrum"}, Transition::None, false);
    }
    ~ANavigationView() override { qt::setMotionWanted(true); }

    void push() { navigation().show(*_second, {"Kestrum", "Serving Cell"}, Transition::Push, true); }
    void pop() { navigation().show(*_first, {"Kestrum"}, Transition::Pop, true); }
    bool comesToRest()
    {
        return QTest::qWaitFor([&] { return !navigation().isMoving(); });
    }

    Rows firstRows = Rows::leaves(5), secondRows = Rows::leaves(8);
    std::unique_ptr<TableScreen> _first, _second;
};

TEST_F(ANavigationView, NamesWhereTheBackButtonGoes)
{
    makeVisible();
    EXPECT_FALSE(navigation().titleBar().back().isVisible());
    push();
    EXPECT_TRUE(navigation().titleBar().back().isVisible());
    EXPECT_EQ(navigation().titleBar().back().text(), "Kestrum");
    EXPECT_EQ(navigation().titleBar().back().accessibleName(), "Back to Kestrum");
    EXPECT_EQ(navigation().titleBar().title(), "Serving Cell");
    pop();
    EXPECT_FALSE(navigation().titleBar().back().isVisible());
}

TEST_F(ANavigationView, FollowsTitlesThatChange)
{
    push();
    navigation().setTitles({"IFX", "Neighbour"});
    EXPECT_EQ(navigation().titleBar().title(), "Neighbour");
    EXPECT_EQ(navigation().titleBar().back().text(), "IFX");
}

TEST_F(ANavigationView, CutsALongTitleButSaysItWhole)
{
    makeVisible();
    const std::string title(300, 'W');
    navigation().setTitles({"A root with a name that is rather long for a button", title});
    EXPECT_EQ(navigation().titleBar().title().toStdString(), title);
    EXPECT_LE(navigation().titleBar().back().width(), 390 * 2 / 5);
}

const std::string kLongTitle = "Connected mode LTE Intra-frequency Measurement";

TEST_F(ANavigationView, ShowsALongTitleWholeOnEveryHandset)
{
    makeVisible();
    push();
    for (const int width : {390, 360, 320}) {
        window().resize(width, 640);
        navigation().setTitles({"Kestrum", "Neighbour Cells", kLongTitle});
        EXPECT_FALSE(navigation().titleBar().label().isCut()) << width;
        EXPECT_GE(navigation().titleBar().label().font().pixelSize(), 13);
    }
}

TEST_F(ANavigationView, LetsTheBackButtonGiveWayToALongTitle)
{
    makeVisible();
    push();
    const auto& bar = navigation().titleBar();
    const auto backWidth = [&](const std::string& title) {
        navigation().setTitles({"Serving Cell Measurements", title});
        return navigation().titleBar().back().width();
    };
    const int whole = backWidth("PLMN");
    EXPECT_EQ(bar.label().font().pixelSize(), 17);
    std::string title;
    while (qt::measured(QString::fromStdString(title), qt::semiboldFont(17)).width < 260) // of 390
        title += 'n';
    const int shorter = backWidth(title);
    EXPECT_LT(shorter, whole);
    EXPECT_GT(shorter, 44);
    EXPECT_EQ(bar.label().font().pixelSize(), 17);
    EXPECT_EQ(backWidth(kLongTitle), 44) << "the chevron alone";
    EXPECT_EQ(navigation().titleBar().back().accessibleName(), "Back to Serving Cell Measurements");
    EXPECT_EQ(backWidth("PLMN"), whole);
}

TEST_F(ANavigationView, NamesAPaneOfTwoLettersOnItsBackButton)
{
    makeVisible();
    navigation().setTitles({"1x", "Radio"});
    const QImage named = navigation().titleBar().back().grab().toImage();
    navigation().setTitles({"", "Radio"});
    EXPECT_NE(navigation().titleBar().back().grab().toImage(), named);
}

TEST_F(ANavigationView, TellsATitleThatIsCutInItsToolTip)
{
    makeVisible();
    const std::string title(300, 'W');
    navigation().setTitles({title});
    EXPECT_EQ(navigation().titleBar().label().toolTip().toStdString(), title);
    navigation().setTitles({"Kestrum"});
    EXPECT_EQ(navigation().titleBar().label().toolTip(), "");
}

TEST_F(ANavigationView, ShowsANoticeWholeOverItsPanesUntilItIsTakenAway)
{
    makeVisible();
    const std::string path = "/home/tester/.local/state/kestrum/DiagnosticLogs/KestrumSnapshot-1794809148.kestrum";
    navigation().setNotice("Saved to " + path);
    const auto& notice = navigation().notice();
    EXPECT_TRUE(notice.isVisible());
    EXPECT_EQ(notice.text().toStdString(), "Saved to " + path);
    EXPECT_GT(notice.height(), 44) << "it is broken into lines";
    EXPECT_EQ(notice.mapTo(&window(), notice.rect().bottomLeft()).y(), window().height() - 48 - 1);
    push();
    EXPECT_TRUE(notice.isVisible());
    EXPECT_TRUE(notice.testAttribute(Qt::WA_TransparentForMouseEvents));
    navigation().setNotice("");
    EXPECT_FALSE(notice.isVisible());
}

TEST_F(ANavigationView, TakesNoInputOnAPaneThatLeaves)
{
    makeVisible();
    push();
    ASSERT_TRUE(navigation().isMoving());
    EXPECT_FALSE(screen(*_first).table().isVisible());
    click(window(), {100, 48 + 22});
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Down);
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);
    EXPECT_THAT(firstRows.selected, IsEmpty());
    EXPECT_THAT(secondRows.selected, testing::Not(IsEmpty()));
    EXPECT_TRUE(comesToRest());
}

TEST_F(ANavigationView, SlidesThePaneToItsPlace)
{
    makeVisible();
    push();
    EXPECT_GT(table().x(), 0);
    ASSERT_TRUE(comesToRest());
    EXPECT_EQ(table().x(), 0);
    pop();
    EXPECT_LT(table().x(), 0);
    ASSERT_TRUE(comesToRest());
    EXPECT_EQ(table().x(), 0);
}

TEST_F(ANavigationView, ChangesPanesAtOnceWhereMotionIsNotWanted)
{
    qt::setMotionWanted(false);
    makeVisible();
    push();
    EXPECT_FALSE(navigation().isMoving());
    EXPECT_EQ(table().x(), 0);
    EXPECT_EQ(&table(), &screen(*_second).table());
}

TEST_F(ANavigationView, ShowsTheNextPaneWhileOneStillMoves)
{
    makeVisible();
    push();
    pop();
    ASSERT_TRUE(comesToRest());
    EXPECT_EQ(&table(), &screen(*_first).table());
    EXPECT_TRUE(table().isVisible());
    EXPECT_EQ(table().x(), 0);
}

TEST_F(ANavigationView, ReleasesAPaneThatWasRemoved)
{
    makeVisible();
    push();
    pop();
    _second.reset();
    EXPECT_TRUE(comesToRest());
    EXPECT_EQ(&table(), &screen(*_first).table());
}

TEST_F(ANavigationView, GoesBackByButtonKeysAndMouse)
{
    makeVisible();
    push();
    ASSERT_TRUE(comesToRest());
    click(navigation().titleBar().back());
    EXPECT_EQ(backs, 1);
    QTest::keyClick(&table(), Qt::Key_Escape);
    EXPECT_EQ(backs, 2);
    QTest::keyClick(&table(), Qt::Key_Backspace);
    EXPECT_EQ(backs, 3);
    click(*table().viewport(), {100, 100}, Qt::BackButton);
    EXPECT_EQ(backs, 4);
}

TEST_F(ANavigationView, GoesBackByASwipeFromTheLeftEdge)
{
    makeVisible();
    push();
    ASSERT_TRUE(comesToRest());
    drag(*table().viewport(), {10, 100}, {30, 100});
    EXPECT_EQ(backs, 0);
    drag(*table().viewport(), {10, 100}, {150, 110});
    EXPECT_EQ(backs, 1);
    EXPECT_THAT(secondRows.selected, IsEmpty());
}

TEST_F(ANavigationView, DoesNotGoBackFromTheRoot)
{
    makeVisible();
    QTest::keyClick(&table(), Qt::Key_Escape);
    QTest::keyClick(&table(), Qt::Key_Backspace);
    drag(*table().viewport(), {10, 100}, {150, 110});
    EXPECT_EQ(backs, 0);
}

TEST_F(ANavigationView, ComesBackToAPaneWhereItWasLeft)
{
    firstRows = Rows::leaves(100);
    firstRows.rows[50].value.reset();
    makeVisible();
    screen(*_first).table().reloadData();
    for (int i = 0; i <= 50; ++i)
        QTest::keyClick(&table(), Qt::Key_Down);
    QTest::keyClick(&table(), Qt::Key_Return);
    ASSERT_THAT(firstRows.selected, ElementsAre(50u));
    ASSERT_EQ(table().selected(), 50u);
    push();
    EXPECT_TRUE(table().cellAt(0)->look().ringed) << "the keyboard goes along";
    pop();
    EXPECT_EQ(table().selected(), std::nullopt);
    EXPECT_EQ(table().current(), 50u);
    EXPECT_TRUE(table().cellAt(50)->look().ringed);
    EXPECT_TRUE(table().hasFocus());
}

TEST_F(ANavigationView, DoesNotShowTheRingAgainAfterAMousePress)
{
    makeVisible();
    QTest::keyClick(&table(), Qt::Key_Down);
    ASSERT_TRUE(table().cellAt(0)->look().ringed);
    push();
    ASSERT_TRUE(comesToRest());
    click(navigation().titleBar().back());
    pop();
    EXPECT_EQ(table().current(), 0u);
    EXPECT_FALSE(table().cellAt(0)->look().ringed);
}

TEST_F(ANavigationView, HidesTheToolbar)
{
    makeVisible();
    EXPECT_TRUE(screen(*_first).toolbar().isVisible());
    navigation().setToolbarHidden(true);
    EXPECT_FALSE(screen(*_first).toolbar().isVisible());
    EXPECT_EQ(table().height(), window().height() - 48);
}

TEST_F(ANavigationView, ShowsTheToolbarOfTheTopPaneAlone)
{
    makeVisible();
    push();
    EXPECT_TRUE(screen(*_second).toolbar().isVisible());
    EXPECT_FALSE(screen(*_first).toolbar().isVisible());
}

} // namespace
} // namespace kestrum
