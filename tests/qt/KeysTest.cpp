#include "QtTest.h"

#include "frontends/qt/ContextMenu.h"
#include "frontends/qt/Motion.h"

#include <QClipboard>
#include <QGuiApplication>

#include <algorithm>
#include <utility>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

QString clipboard()
{
    return QGuiApplication::clipboard()->text();
}

/// A pane above the root pane, with keyboard, mouse and finger input.
class Keys : public InAWindow {
protected:
    Keys()
    {
        qt::setMotionWanted(false);
        rows.rows[1].value = "-95.25 dBm";
        rows.rows[3] = {"Neighbours", std::nullopt};
        rows.rows[7] = {"Serving Neighbour", "7"};
        _screen = screenOf(rows);
        _screen->setToolbarItems({LabelItem{"Updated", systemFont(14)}, SaveItem{[this] { ++saves; }}}, true);
        navigation().show(*_screen, {"Kestrum", "Serving Cell"}, Transition::None, false);
        QGuiApplication::clipboard()->setText("before");
        makeVisible();
    }
    ~Keys() override { qt::setMotionWanted(true); }

    void key(Qt::Key key, Qt::KeyboardModifiers modifiers = {})
    {
        QWidget* const popup = QApplication::activePopupWidget();
        QTest::keyClick(popup ? popup : QApplication::focusWidget(), key, modifiers);
    }
    void type(const char* text) { QTest::keyClicks(QApplication::focusWidget(), text); }
    void walkTo(std::size_t row)
    {
        key(Qt::Key_Home);
        for (std::size_t i = 0; i < row; ++i)
            key(Qt::Key_Down);
    }
    static qt::ContextMenu* menu() { return dynamic_cast<qt::ContextMenu*>(QApplication::activePopupWidget()); }
    static std::vector<std::string> choices()
    {
        std::vector<std::string> texts;
        if (menu())
            for (const auto* each : menu()->actions())
                texts.push_back(each->text().toStdString());
        return texts;
    }
    static void choose(const QString& text)
    {
        for (auto* each : menu()->actions())
            if (each->text() == text)
                QTest::mouseClick(menu(), Qt::LeftButton, {}, menu()->actionGeometry(each).center());
    }
    bool offers(SheetKind kind, std::optional<std::size_t> row) const override
    {
        const bool isOfRow = kind == SheetKind::Trend || kind == SheetKind::Meaning;
        return std::ranges::count(offered, kind) && isOfRow == row.has_value();
    }
    void sheetRequested(SheetKind kind, std::optional<std::size_t> row) override { requested.emplace_back(kind, row); }
    qt::Jump& jump() { return navigation().jump(); }

    Rows rows = Rows::leaves(40);
    std::unique_ptr<TableScreen> _screen;
    std::vector<SheetKind> offered;
    std::vector<std::pair<SheetKind, std::optional<std::size_t>>> requested;
    int saves = 0;
};

TEST_F(Keys, CloseTheWindowByControlQAndControlW)
{
    for (const auto letter : {Qt::Key_Q, Qt::Key_W}) {
        window().show();
        ASSERT_TRUE(QTest::qWaitForWindowActive(&window()));
        key(letter, Qt::ControlModifier);
        EXPECT_FALSE(window().isVisible()) << letter;
    }
}

TEST_F(Keys, CloseTheWindowUnderAnAlertToo)
{
    toolkit().showAlert("File Error", "Unable to write file to disk", "Close");
    key(Qt::Key_Q, Qt::ControlModifier);
    EXPECT_FALSE(window().isVisible());
}

TEST_F(Keys, GiveTheWindowTheWholeScreenAndTakeItBackByF11)
{
    const QSize before = window().size();
    key(Qt::Key_F11);
    EXPECT_TRUE(window().isFullScreen());
    EXPECT_TRUE(QTest::qWaitFor([&] { return navigation().size() == window().screen()->size(); }));
    key(Qt::Key_F11);
    EXPECT_FALSE(window().isFullScreen());
    EXPECT_TRUE(QTest::qWaitFor([&] { return navigation().size() == before; }));
}

TEST_F(Keys, GoBackByAltLeft)
{
    walkTo(1);
    key(Qt::Key_Left, Qt::AltModifier);
    EXPECT_EQ(backs, 1);
    key(Qt::Key_Left);
    EXPECT_EQ(backs, 1);
}

TEST_F(Keys, FreezeBySpaceAndLookBackAndForth)
{
    key(Qt::Key_Space);
    EXPECT_THAT(looks, ElementsAre(Look::Freeze));
    looks.clear();
    type(",.");
    EXPECT_THAT(looks, ElementsAre(Look::Earlier, Look::Later));
    walkTo(1);
    looks.clear();
    key(Qt::Key_Space);
    EXPECT_THAT(looks, ElementsAre(Look::Freeze));
    EXPECT_THAT(rows.selected, IsEmpty()) << "Enter opens the row";
}

TEST_F(Keys, HeldSpaceFreezesOnce)
{
    QTest::keyPress(QApplication::focusWidget(), Qt::Key_Space);
    QTest::simulateEvent(QApplication::focusWidget(), true, Qt::Key_Space, Qt::NoModifier, " ", true);
    EXPECT_EQ(looks.size(), 1u);
}

TEST_F(Keys, TypeABlankWhereATextIsEdited)
{
    type("/");
    type("serving nei");
    EXPECT_EQ(table().current(), 7u);
    type(",.");
    EXPECT_THAT(looks, IsEmpty());
    key(Qt::Key_Escape);
}

TEST_F(Keys, DoNotFreezeUnderAnAlert)
{
    toolkit().showAlert("File Error", "Unable to write file to disk", "Close");
    key(Qt::Key_Space); // closes the alert
    EXPECT_THAT(looks, IsEmpty());
}

TEST_F(Keys, SaveByControlSWhereSaveIsOffered)
{
    key(Qt::Key_S, Qt::ControlModifier);
    EXPECT_EQ(saves, 1);
    _screen->setToolbarItems({LabelItem{"Updated", systemFont(14)}}, true);
    key(Qt::Key_S, Qt::ControlModifier);
    EXPECT_EQ(saves, 1);
}

TEST_F(Keys, DoNothingUnderAnAlert)
{
    toolkit().showAlert("File Error", "Unable to write file to disk", "Close");
    key(Qt::Key_S, Qt::ControlModifier);
    key(Qt::Key_F, Qt::ControlModifier);
    key(Qt::Key_C, Qt::ControlModifier);
    key(Qt::Key_Left, Qt::AltModifier);
    key(Qt::Key_F10, Qt::ShiftModifier);
    EXPECT_EQ(saves + backs, 0);
    EXPECT_TRUE(jump().isHidden());
    EXPECT_EQ(menu(), nullptr);
    EXPECT_EQ(clipboard(), "before");
    key(Qt::Key_Return);
}

TEST_F(Keys, CopyTheRowByControlC)
{
    key(Qt::Key_C, Qt::ControlModifier);
    EXPECT_EQ(clipboard(), "before") << "no row is chosen yet";
    walkTo(1);
    key(Qt::Key_C, Qt::ControlModifier);
    EXPECT_EQ(clipboard(), "Key 1\t-95.25 dBm");
    walkTo(3);
    key(Qt::Key_C, Qt::ControlModifier);
    EXPECT_EQ(clipboard(), "Neighbours");
}

TEST_F(Keys, NameThePaneInTheWindowsTitle)
{
    EXPECT_EQ(window().windowTitle(), "Serving Cell");
    EXPECT_EQ(window().windowHandle()->title(), "Serving Cell");
    navigation().setTitles({"Kestrum"});
    EXPECT_EQ(window().windowTitle(), "Kestrum");
}

// The row's menu

TEST_F(Keys, OpenTheMenuOfTheCurrentRow)
{
    walkTo(1);
    key(Qt::Key_Menu);
    EXPECT_THAT(choices(),
                ElementsAre("Copy value", "Copy row", "Copy pane as text", "Freeze", "Keep the last 15 minutes"));
    key(Qt::Key_Escape);
    EXPECT_EQ(menu(), nullptr);
    EXPECT_EQ(backs, 0);
    walkTo(3);
    key(Qt::Key_F10, Qt::ShiftModifier);
    EXPECT_THAT(choices(), ElementsAre("Copy row", "Copy pane as text", "Freeze", "Keep the last 15 minutes"))
        << "what opens has no value";
    key(Qt::Key_Down);
    key(Qt::Key_Return);
    EXPECT_EQ(clipboard(), "Neighbours");
    EXPECT_THAT(rows.selected, IsEmpty());
}

TEST_F(Keys, CopyFromTheMenuByTheMouse)
{
    click(*table().viewport(), middleOf(table(), 1), Qt::RightButton);
    ASSERT_THAT(choices(),
                ElementsAre("Copy value", "Copy row", "Copy pane as text", "Freeze", "Keep the last 15 minutes"));
    EXPECT_EQ(table().current(), 1u);
    choose("Copy value");
    EXPECT_EQ(clipboard(), "-95.25 dBm");
    EXPECT_EQ(menu(), nullptr);
    click(*table().viewport(), middleOf(table(), 1), Qt::RightButton);
    choose("Copy row");
    EXPECT_EQ(clipboard(), "Key 1\t-95.25 dBm");
    EXPECT_THAT(rows.selected, IsEmpty());
}

TEST_F(Keys, CopyTheWholePaneWithTheRowsOutOfView)
{
    click(*table().viewport(), middleOf(table(), 1), Qt::RightButton);
    choose("Copy pane as text");
    const QStringList lines = clipboard().split('\n');
    ASSERT_EQ(lines.size(), 41);
    EXPECT_EQ(lines[1], "Key 1\t-95.25 dBm");
    EXPECT_EQ(lines[3], "Neighbours");
    EXPECT_EQ(lines[39], "Key 39\tValue 39");
    EXPECT_EQ(lines[40], "");
}

TEST_F(Keys, CopyTheRowThatTheMenuWasOpenedOn)
{
    click(*table().viewport(), middleOf(table(), 1), Qt::RightButton);
    rows.rows.insert(rows.rows.begin(), {"new", "row"});
    _screen->table().reloadData();
    choose("Copy row");
    EXPECT_EQ(clipboard(), "Key 1\t-95.25 dBm");
}

TEST_F(Keys, OpenTheMenuByALongPressOfAFinger)
{
    static QPointingDevice* const device = QTest::createTouchDevice();
    const QPoint at = table().viewport()->mapTo(&window(), middleOf(table(), 1));
    QTest::touchEvent(window().windowHandle(), device).press(0, at);
    EXPECT_TRUE(QTest::qWaitFor([] { return menu() != nullptr; }));
    QTest::touchEvent(window().windowHandle(), device).release(0, at);
    EXPECT_THAT(choices(),
                ElementsAre("Copy value", "Copy row", "Copy pane as text", "Freeze", "Keep the last 15 minutes"));
    EXPECT_THAT(rows.selected, IsEmpty());
    for (const auto* each : menu()->actions())
        EXPECT_GE(menu()->actionGeometry(const_cast<QAction*>(each)).height(), 44);
    key(Qt::Key_Escape);
    click(*table().viewport(), middleOf(table(), 2));
    EXPECT_THAT(rows.selected, ElementsAre(2u));
}

TEST_F(Keys, CloseTheMenuWhenItsPaneIsCoveredOrLeaves)
{
    walkTo(1);
    key(Qt::Key_Menu);
    ASSERT_NE(menu(), nullptr);
    toolkit().showAlert("File Error", "Unable to write file to disk", "Close");
    EXPECT_EQ(menu(), nullptr);
    key(Qt::Key_Return);

    key(Qt::Key_Menu);
    ASSERT_NE(menu(), nullptr);
    Rows others = Rows::leaves(1);
    const auto other = screenOf(others);
    navigation().show(*other, {"Kestrum"}, Transition::Pop, false);
    EXPECT_EQ(menu(), nullptr);
    navigation().show(*_screen, {"Kestrum"}, Transition::None, false);
}

TEST_F(Keys, OpenTheSheetsOfTheRowAndOfThePane)
{
    offered = {SheetKind::Trend, SheetKind::Events};
    type("te");
    EXPECT_THAT(requested, ElementsAre(std::pair(SheetKind::Events, std::nullopt))) << "no row is current yet";
    walkTo(1);
    type("tevi");
    EXPECT_THAT(requested, ElementsAre(std::pair(SheetKind::Events, std::nullopt),
                                       std::pair(SheetKind::Trend, std::optional<std::size_t>(1)),
                                       std::pair(SheetKind::Events, std::nullopt)));
    key(Qt::Key_T, Qt::ControlModifier);
    EXPECT_EQ(requested.size(), 3u);
}

TEST_F(Keys, OfferTheSheetsOfTheRowInItsMenu)
{
    offered = {SheetKind::Overview, SheetKind::Trend, SheetKind::Meaning};
    click(*table().viewport(), middleOf(table(), 1), Qt::RightButton);
    EXPECT_THAT(choices(), ElementsAre("Copy value", "Copy row", "Copy pane as text", "Freeze", "Overview", "Trend",
                                       "What it means", "Keep the last 15 minutes"));
    rows.rows.insert(rows.rows.begin(), {"new", "row"});
    _screen->table().reloadData();
    choose("Trend");
    EXPECT_THAT(requested, ElementsAre(std::pair(SheetKind::Trend, std::optional<std::size_t>(2)))) << "the same row";
}

TEST_F(Keys, KeepFromAKeyAndFromTheMenu)
{
    type("k");
    EXPECT_EQ(keeps, 0);
    type("K");
    EXPECT_EQ(keeps, 1);
    walkTo(1);
    key(Qt::Key_Menu);
    choose("Keep the last 15 minutes");
    EXPECT_EQ(keeps, 2);
}

TEST_F(Keys, HaveTheWholeMenuOnASmallScreen)
{
    offered = {SheetKind::Glance,  SheetKind::Overview, SheetKind::Trend,
               SheetKind::Meaning, SheetKind::Events,   SheetKind::Cells};
    walkTo(1);
    key(Qt::Key_Menu);
    ASSERT_NE(menu(), nullptr);
    EXPECT_EQ(choices().size(), 11u);
    EXPECT_LE(menu()->sizeHint().width(), 360);
    EXPECT_LE(menu()->sizeHint().height(), 640);
}

// Search for a name

TEST_F(Keys, JumpToANameWhileItIsTyped)
{
    key(Qt::Key_Slash);
    ASSERT_TRUE(jump().field().hasFocus());
    type("neigh");
    EXPECT_EQ(table().current(), 3u);
    EXPECT_TRUE(table().cellAt(3)->look().ringed);
    EXPECT_TRUE(jump().hasFound());
    key(Qt::Key_Return);
    EXPECT_TRUE(jump().isHidden());
    EXPECT_TRUE(table().hasFocus());
    EXPECT_EQ(table().current(), 3u);
    EXPECT_THAT(rows.selected, IsEmpty());

    type("n");
    EXPECT_EQ(table().current(), 7u);
    key(Qt::Key_F3);
    EXPECT_EQ(table().current(), 3u) << "round the end";
}

TEST_F(Keys, JumpToARowOutOfViewByControlF)
{
    key(Qt::Key_F, Qt::ControlModifier);
    type("y 38");
    EXPECT_EQ(table().current(), 38u);
    EXPECT_NE(table().cellAt(38), nullptr);
    key(Qt::Key_Return);
}

TEST_F(Keys, TypeTheNameInTheColoursOfTheScheme)
{
    key(Qt::Key_Slash);
    for (const auto* colours : {&qt::darkColours(), &qt::lightColours()}) {
        QApplication::setPalette(qt::paletteOf(*colours));
        EXPECT_TRUE(QTest::qWaitFor([&] { return jump().field().palette().color(QPalette::Text) == colours->ink; }));
    }
    key(Qt::Key_Escape);
}

TEST_F(Keys, ReturnWhereTheJumpBeganOnEscape)
{
    walkTo(5);
    key(Qt::Key_Slash);
    type("key 9");
    EXPECT_EQ(table().current(), 9u);
    type("zzz");
    EXPECT_EQ(table().current(), 5u);
    EXPECT_FALSE(jump().hasFound());
    key(Qt::Key_Escape);
    EXPECT_EQ(table().current(), 5u);
    EXPECT_TRUE(jump().isHidden());
    EXPECT_EQ(backs, 0);
    key(Qt::Key_Slash);
    key(Qt::Key_Backspace);
    EXPECT_TRUE(jump().isHidden());
    EXPECT_EQ(backs, 0);
}

TEST_F(Keys, EndTheJumpOnATapAndWithItsPane)
{
    key(Qt::Key_Slash);
    type("key 9");
    click(*table().viewport(), middleOf(table(), 2));
    EXPECT_TRUE(jump().isHidden());
    EXPECT_THAT(rows.selected, ElementsAre(2u));

    key(Qt::Key_Slash);
    ASSERT_FALSE(jump().isHidden());
    Rows others = Rows::leaves(1);
    const auto other = screenOf(others);
    navigation().show(*other, {"Kestrum"}, Transition::Pop, false);
    EXPECT_TRUE(jump().isHidden());
    EXPECT_TRUE(table().hasFocus());
    navigation().show(*_screen, {"Kestrum"}, Transition::None, false);
}

} // namespace
} // namespace kestrum
