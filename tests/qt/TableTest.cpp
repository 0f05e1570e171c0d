#include "QtTest.h"

#include <QHelpEvent>
#include <QScrollBar>
#include <QScroller>
#include <QToolTip>
#include <QWheelEvent>

#include <cmath>
#include <set>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

const std::string kLong(200, '7');

class ATable : public InAWindow {
protected:
    /// Shows the rows in a table that has room for 16 of them.
    void show(Rows& rows)
    {
        _screen = screenOf(rows);
        navigation().show(*_screen, {"Kestrum"}, Transition::None, false);
        window().resize(390, 48 + 16 * 44 + 48);
        makeVisible();
    }
    void reload() { _screen->table().reloadData(); }
    void key(Qt::Key key) { QTest::keyClick(&table(), key); }
    int offset() { return table().verticalScrollBar()->value(); }
    void scroll(int to) { table().verticalScrollBar()->setValue(to); }
    qt::Cell& cell(std::size_t row) { return *table().cellAt(row); }

    std::unique_ptr<TableScreen> _screen;
};

TEST_F(ATable, ShowsTenThousandRowsWithTheCellsInView)
{
    Rows rows = Rows::leaves(10'000);
    show(rows);
    EXPECT_EQ(table().rows(), 10'000u);
    EXPECT_EQ(table().cells(), 16u);
    EXPECT_EQ(rows.asked, 16u);
}

TEST_F(ATable, ScrollsThroughTenThousandRowsWithABoundedNumberOfCells)
{
    Rows rows = Rows::leaves(10'000);
    show(rows);
    for (int at = 0; at < 10'000 * 44; at += 10 * 44)
        scroll(at);
    EXPECT_EQ(cell(9'999).spoken(), "Key 9999, Value 9999");
    EXPECT_LE(table().cells(), 16u + 256u + 17u);
}

TEST_F(ATable, AsksForNothingBeforeItIsSeen)
{
    Rows rows = Rows::leaves(5);
    const auto screen = screenOf(rows);
    screen->table().reloadData();
    EXPECT_EQ(rows.asked, 0u);
}

TEST_F(ATable, KeepsEveryRowsCellAcrossAReload)
{
    Rows rows = Rows::leaves(10);
    rows.rows[2].value.reset();
    rows.rows[7].value.reset();
    show(rows);
    const auto before = table().cellsInView();
    rows.rows[3].value = "new";
    reload();
    EXPECT_EQ(table().cellsInView(), before);
    EXPECT_EQ(cell(2).spoken(), "Key 2");
    EXPECT_EQ(cell(3).spoken(), "Key 3, new");
}

TEST_F(ATable, GivesARowThatComesBackIntoViewTheCellThatShowedIt)
{
    Rows rows = Rows::leaves(100);
    show(rows);
    const auto* first = table().cellAt(0);
    scroll(40 * 44);
    EXPECT_EQ(table().cellAt(0), nullptr);
    scroll(0);
    EXPECT_EQ(table().cellAt(0), first);
}

TEST_F(ATable, ReadsWellWithMixedRowsOnceScrolled)
{
    Rows rows = Rows::leaves(200);
    for (std::size_t i = 0; i < 200; i += 3)
        rows.rows[i].value.reset();
    show(rows);
    std::set<std::string> wrong;
    for (int at = 0; at <= 184 * 44; at += 44) {
        scroll(at);
        for (const auto* each : table().cellsInView()) {
            const std::size_t row = each->row();
            const std::string number = std::to_string(row);
            if (each->spoken().toStdString() != (row % 3 ? "Key " + number + ", Value " + number : "Key " + number))
                wrong.insert(number);
        }
    }
    EXPECT_THAT(wrong, IsEmpty());
}

TEST_F(ATable, NeverHidesARowDuringAReload)
{
    class Watch final : public QObject {
    public:
        int hidden = 0;
        bool eventFilter(QObject*, QEvent* event) override
        {
            hidden += event->type() == QEvent::Hide;
            return false;
        }
    } watch;
    Rows rows = Rows::leaves(20);
    show(rows);
    for (auto* each : table().cellsInView())
        each->installEventFilter(&watch);
    reload();
    EXPECT_EQ(watch.hidden, 0);
    EXPECT_EQ(table().cellsInView().size(), 16u);
}

TEST_F(ATable, KeepsScrollOffsetSelectionAndFocusAcrossAReload)
{
    Rows rows = Rows::leaves(100);
    rows.rows[45].value.reset();
    show(rows);
    scroll(40 * 44 + 13);
    tap(table(), 45);
    ASSERT_EQ(table().selected(), 45u);
    reload();
    EXPECT_EQ(offset(), 40 * 44 + 13);
    EXPECT_EQ(table().selected(), 45u);
    EXPECT_EQ(table().current(), 45u);
    EXPECT_TRUE(cell(45).look().selected);
    EXPECT_TRUE(table().hasFocus());
}

TEST_F(ATable, KeepsFocusAndSelectionOnTheirRowWhenOneIsInsertedAbove)
{
    Rows rows = Rows::leaves(5);
    rows.rows[3].value.reset();
    show(rows);
    for (int i = 0; i < 4; ++i)
        key(Qt::Key_Down);
    key(Qt::Key_Return);
    ASSERT_EQ(table().selected(), 3u);
    rows.rows.insert(rows.rows.begin(), {"Serving", std::nullopt});
    reload();
    EXPECT_EQ(table().current(), 4u);
    EXPECT_EQ(table().selected(), 4u);
    EXPECT_EQ(cell(4).name(), "Key 3");
    EXPECT_TRUE(cell(4).look().ringed);
    EXPECT_TRUE(cell(4).look().selected);
    EXPECT_FALSE(cell(3).look().ringed);
    key(Qt::Key_Return);
    EXPECT_THAT(rows.selected, ElementsAre(3u, 4u));
}

TEST_F(ATable, KeepsFocusOnARowOutOfView)
{
    Rows rows = Rows::leaves(100);
    show(rows);
    key(Qt::Key_End);
    scroll(0);
    rows.rows.erase(rows.rows.begin() + 40, rows.rows.begin() + 50);
    reload();
    EXPECT_EQ(table().current(), 89u);
    EXPECT_EQ(offset(), 0);
}

TEST_F(ATable, PassesFocusToTheNeighbourOfARemovedRow)
{
    Rows rows = Rows::leaves(5);
    show(rows);
    for (int i = 0; i < 3; ++i)
        key(Qt::Key_Down);
    rows.rows.erase(rows.rows.begin() + 2);
    rows.rows.insert(rows.rows.begin(), {"new", "row"});
    reload();
    EXPECT_EQ(cell(table().current().value()).name(), "Key 3");
    key(Qt::Key_Down);
    rows.rows.pop_back();
    reload();
    EXPECT_EQ(cell(table().current().value()).name(), "Key 3");
}

TEST_F(ATable, DoesNothingForATapOnARowThatMovedUnderTheFinger)
{
    Rows rows = Rows::leaves(5);
    show(rows);
    const QPoint at = middleOf(table(), 2);
    press(*table().viewport(), at);
    rows.rows.insert(rows.rows.begin(), {"Serving", std::nullopt});
    reload();
    release(*table().viewport(), at);
    EXPECT_THAT(rows.selected, IsEmpty());
}

TEST_F(ATable, KeepsARowsSidewaysScrollAcrossAReload)
{
    Rows rows = Rows::leaves(10);
    rows.rows[4].value = kLong;
    show(rows);
    cell(4).setSideways(77);
    reload();
    EXPECT_EQ(cell(4).sideways(), 77);
}

TEST_F(ATable, KeepsARowsSidewaysScrollWhileItIsOutOfView)
{
    Rows rows = Rows::leaves(1'000);
    for (auto& row : rows.rows)
        row.value = kLong;
    show(rows);
    cell(4).setSideways(77);
    for (int at = 0; at < 900 * 44; at += 10 * 44)
        scroll(at);
    for (const auto* each : table().cellsInView())
        EXPECT_EQ(each->sideways(), 0);
    scroll(0);
    EXPECT_EQ(cell(4).sideways(), 77);
    EXPECT_EQ(cell(5).sideways(), 0);
}

TEST_F(ATable, StaysWithinItsRowsWhenTheyBecomeFewer)
{
    Rows rows = Rows::leaves(100);
    show(rows);
    key(Qt::Key_End);
    ASSERT_EQ(table().current(), 99u);
    rows.rows.resize(20);
    reload();
    EXPECT_EQ(offset(), 4 * 44);
    EXPECT_EQ(table().current(), 19u);
    rows.rows.clear();
    reload();
    EXPECT_EQ(table().current(), std::nullopt);
    EXPECT_THAT(table().cellsInView(), IsEmpty());
    key(Qt::Key_Return);
    EXPECT_THAT(rows.selected, IsEmpty());
}

TEST_F(ATable, RequestsItsVisibleRowsAgainWhenItsWidthChanges)
{
    Rows rows = Rows::leaves(10);
    show(rows);
    const double before = cell(0).contentBounds().width;
    window().resize(500, window().height());
    EXPECT_EQ(cell(0).contentBounds().width, before + 110);
    EXPECT_EQ(rows.asked, 20u);
    window().resize(500, window().height() - 1);
    EXPECT_EQ(rows.asked, 20u);
}

TEST_F(ATable, KeepsItsRowsToAReadableColumnOnAWideScreen)
{
    Rows rows = Rows::leaves(3);
    show(rows);
    window().resize(1280, 800);
    EXPECT_EQ(cell(0).geometry(), QRect(280, 0, 720, 44));
}

TEST_F(ATable, GivesTheContentAreaTheRowWithoutItsAccessory)
{
    Rows rows = Rows::leaves(2);
    rows.rows[1].value.reset();
    show(rows);
    EXPECT_EQ(cell(0).contentBounds(), (Rect{0, 0, 380, 44}));
    EXPECT_EQ(cell(1).contentBounds(), (Rect{0, 0, 358, 44}));
}

/// The layout at the width where a value just fits, with the real font's measures.
TEST_F(ATable, PutsAValueThatFitsExactlyBehindItsKey)
{
    Rows rows = Rows::leaves(1);
    show(rows);
    const auto width = [](const std::string& text) { return toolkit().measure(text, boldSystemFont(15)).width; };
    std::string key, value;
    const auto needed = [&] { return width(key) + 60 + width(value); };
    const auto isWhole = [&] { return needed() == std::floor(needed()); };
    // A window's width is a whole number of points, so the width of the texts must be one too.
    for (std::size_t more = 0; more < 64 && (key.empty() || !isWhole()); ++more)
        for (char first = '!'; first <= '~' && (key.empty() || !isWhole()); ++first) {
            key = std::string("Measured RSRP ") + first;
            value = "-95.25 dBm, and falling " + std::string(more, 'i');
        }
    ASSERT_TRUE(isWhole()) << needed();
    ASSERT_LT(needed(), 700);
    ASSERT_GT(needed(), 280);
    const auto layout = [&](double content) {
        window().resize(static_cast<int>(content) + 10, window().height());
        auto made = KestrumCell::initWithStyle(toolkit(), table(), CellStyle::KeyAndDetail, "row");
        made->setTexts(key, value);
        made->setLayout();
        EXPECT_EQ(made->cell().contentBounds().width, content);
        return made;
    };
    const auto reach = [](KestrumCell& made) {
        const auto* strip = static_cast<qt::Cell&>(made.cell()).strip();
        return strip ? strip->reach() : 0;
    };
    const auto exact = layout(needed());
    EXPECT_EQ(exact->value()->frame().x, 10 + width(key) + 50);
    EXPECT_EQ(reach(*exact), 0);
    const auto roomy = layout(needed() + 1);
    EXPECT_EQ(roomy->value()->frame().x, needed() + 1 - width(value));
    EXPECT_EQ(reach(*roomy), 0);
    const auto tight = layout(needed() - 1);
    EXPECT_EQ(tight->value()->frame().x, 10 + width(key) + 50);
    EXPECT_EQ(reach(*tight), width(key) + width(value));
}

TEST_F(ATable, SelectsTheRowThatIsTapped)
{
    Rows rows = Rows::leaves(5);
    show(rows);
    tap(table(), 3);
    EXPECT_THAT(rows.selected, ElementsAre(3u));
}

TEST_F(ATable, SelectsARowWhoseLongValueIsTapped)
{
    Rows rows = Rows::leaves(5);
    rows.rows[1].value = kLong;
    show(rows);
    tap(table(), 1);
    EXPECT_THAT(rows.selected, ElementsAre(1u));
}

TEST_F(ATable, SelectsNothingBelowItsLastRow)
{
    Rows rows = Rows::leaves(2);
    show(rows);
    click(*table().viewport(), {100, 300});
    EXPECT_THAT(rows.selected, IsEmpty());
}

TEST_F(ATable, AnswersAPressAtOnce)
{
    Rows rows = Rows::leaves(5);
    show(rows);
    press(*table().viewport(), middleOf(table(), 2));
    EXPECT_TRUE(cell(2).look().pressed);
    EXPECT_THAT(rows.selected, IsEmpty());
    release(*table().viewport(), middleOf(table(), 2));
    EXPECT_FALSE(cell(2).look().pressed);
}

TEST_F(ATable, DoesNothingForATapOnARowRemovedUnderTheFinger)
{
    Rows rows = Rows::leaves(5);
    show(rows);
    const QPoint at = middleOf(table(), 4);
    press(*table().viewport(), at);
    rows.rows.resize(2);
    reload();
    release(*table().viewport(), at);
    EXPECT_THAT(rows.selected, IsEmpty());
}

TEST_F(ATable, ScrollsUnderAFingerWithoutSelecting)
{
    Rows rows = Rows::leaves(100);
    show(rows);
    pressAndMove(*table().viewport(), {200, 500}, {200, 200});
    EXPECT_TRUE(QTest::qWaitFor([&] { return offset() > 250; })); // follows in the next frame
    release(*table().viewport(), {200, 200});
    EXPECT_THAT(rows.selected, IsEmpty());
}

TEST_F(ATable, ScrollsOneRowSidewaysUnderAFinger)
{
    Rows rows = Rows::leaves(100);
    rows.rows[3].value = rows.rows[4].value = kLong;
    show(rows);
    const QPoint from(300, middleOf(table(), 3).y());
    pressAndMove(*table().viewport(), from, from - QPoint(200, 0));
    EXPECT_TRUE(QTest::qWaitFor([&] { return cell(3).sideways() > 150; })); // follows in the next frame
    release(*table().viewport(), from - QPoint(200, 0));
    EXPECT_EQ(cell(4).sideways(), 0);
    EXPECT_EQ(offset(), 0);
    EXPECT_THAT(rows.selected, IsEmpty());
}

TEST_F(ATable, RollsOnAfterAFlickUntilItIsTouched)
{
    Rows rows = Rows::leaves(10'000);
    show(rows);
    drag(*table().viewport(), {200, 600}, {200, 200});
    const int released = offset();
    ASSERT_TRUE(QTest::qWaitFor([&] { return offset() > released + 20; }));
    tap(table(), static_cast<std::size_t>(offset() / 44 + 5));
    EXPECT_EQ(QScroller::scroller(&table())->state(), QScroller::Inactive);
    EXPECT_THAT(rows.selected, IsEmpty());
}

TEST_F(ATable, ScrollsByTheWheelBothWays)
{
    Rows rows = Rows::leaves(100);
    rows.rows[3].value = kLong;
    show(rows);
    const auto turn = [&](QPoint angle, Qt::KeyboardModifiers modifiers) {
        const QPointF at(200, 3 * 44 + 20);
        QWheelEvent wheel(at, table().viewport()->mapToGlobal(at), {}, angle, {}, modifiers, Qt::NoScrollPhase, false);
        QApplication::sendEvent(table().viewport(), &wheel);
    };
    turn({0, -120}, Qt::ShiftModifier);
    EXPECT_EQ(cell(3).sideways(), 60);
    EXPECT_EQ(offset(), 0);
    turn({0, -120}, {});
    EXPECT_EQ(offset(), 60);
}

TEST_F(ATable, IsWalkedThroughByKeys)
{
    Rows rows = Rows::leaves(100);
    show(rows);
    const auto at = [&](Qt::Key pressed) {
        key(pressed);
        return table().current().value();
    };
    EXPECT_EQ(at(Qt::Key_Down), 0u);
    EXPECT_EQ(at(Qt::Key_Down), 1u);
    EXPECT_EQ(at(Qt::Key_Up), 0u);
    EXPECT_EQ(at(Qt::Key_Up), 0u);
    EXPECT_EQ(at(Qt::Key_PageDown), 15u);
    EXPECT_EQ(at(Qt::Key_End), 99u);
    EXPECT_EQ(offset(), 84 * 44);
    EXPECT_EQ(at(Qt::Key_Down), 99u);
    EXPECT_EQ(at(Qt::Key_PageUp), 84u);
    EXPECT_EQ(at(Qt::Key_Home), 0u);
    EXPECT_EQ(offset(), 0);
    EXPECT_TRUE(cell(0).look().ringed);
}

TEST_F(ATable, SelectsByEnter)
{
    Rows rows = Rows::leaves(5);
    show(rows);
    key(Qt::Key_Down);
    key(Qt::Key_Down);
    key(Qt::Key_Return);
    EXPECT_THAT(rows.selected, ElementsAre(1u));
}

TEST_F(ATable, ScrollsItsCurrentRowSidewaysByKeys)
{
    Rows rows = Rows::leaves(5);
    rows.rows[0].value = kLong;
    show(rows);
    key(Qt::Key_Down);
    key(Qt::Key_Right);
    EXPECT_GT(cell(0).sideways(), 0);
    key(Qt::Key_Left);
    EXPECT_EQ(cell(0).sideways(), 0);
}

TEST_F(ATable, BringsAMovedRowBackByHomeBeforeItGoesToTheFirst)
{
    Rows rows = Rows::leaves(5);
    rows.rows[2].value = kLong;
    show(rows);
    for (int i = 0; i < 3; ++i)
        key(Qt::Key_Down);
    key(Qt::Key_Right);
    ASSERT_GT(cell(2).sideways(), 0);
    key(Qt::Key_Home);
    EXPECT_EQ(cell(2).sideways(), 0);
    EXPECT_EQ(table().current(), 2u);
    key(Qt::Key_Home);
    EXPECT_EQ(table().current(), 0u);
}

TEST_F(ATable, BringsAMovedRowBackByADoubleTap)
{
    Rows rows = Rows::leaves(5);
    rows.rows[2].value = kLong;
    show(rows);
    cell(2).setSideways(77);
    tap(table(), 2);
    EXPECT_EQ(cell(2).sideways(), 77) << "a single one leaves it";
    QTest::mouseDClick(table().viewport(), Qt::LeftButton, {}, middleOf(table(), 2));
    EXPECT_EQ(cell(2).sideways(), 0);
}

TEST_F(ATable, MarksALongValueOnlyWhileItsEndIsHidden)
{
    Rows rows = Rows::leaves(3);
    rows.rows[1].value = std::string(60, '7');
    show(rows);
    const auto dots = [&] {
        // The place of the last of the three rows.
        return cell(1).grab().toImage().pixelColor(380 - 2, 26) != qt::lightColours().surface;
    };
    EXPECT_FALSE(cell(0).isCut());
    EXPECT_TRUE(cell(1).isCut());
    EXPECT_TRUE(dots());
    cell(1).setSideways(100'000); // beyond the value's end, limited to the strip
    EXPECT_FALSE(dots());
    const double end = cell(1).sideways();
    cell(1).setSideways(end / 4);
    EXPECT_TRUE(dots());
}

TEST_F(ATable, FadesALongValueAboveAWholeSeparator)
{
    Rows rows = Rows::leaves(3);
    rows.rows[1].value = kLong;
    show(rows);
    cell(1).setSideways(50);
    const QImage picture = cell(1).grab().toImage();
    for (int x = 10; x < 380; ++x)
        ASSERT_EQ(picture.pixelColor(x, 43), qt::lightColours().line) << x;
}

TEST_F(ATable, TellsANameThatIsCutInAToolTip)
{
    Rows rows = Rows::leaves(2);
    const std::string name = "Connected mode LTE Intra-frequency Measurement of every neighbour";
    rows.rows[1] = {name, std::nullopt};
    show(rows);
    const auto tip = [&](std::size_t row) {
        QHelpEvent help(QEvent::ToolTip, middleOf(table(), row),
                        table().viewport()->mapToGlobal(middleOf(table(), row)));
        QApplication::sendEvent(table().viewport(), &help);
        return QToolTip::isVisible() ? QToolTip::text().toStdString() : "";
    };
    EXPECT_EQ(tip(1), name);
    EXPECT_EQ(cell(1).spoken().toStdString(), name);
    EXPECT_FALSE(cell(0).isCut());
}

TEST_F(ATable, ShowsAHintInPlaceOfRows)
{
    Rows rows;
    show(rows);
    EXPECT_FALSE(table().hint().isVisible());
    _screen->setHint("Waiting for the telephony service.\nTo start a simulated one: voxd");
    EXPECT_TRUE(table().hint().isVisible());
    EXPECT_EQ(table().accessibleDescription(), table().hint().text());
    const QImage picture = table().viewport()->grab().toImage();
    bool muted = false;
    for (int x = 0; x < picture.width(); ++x)
        for (int y = 0; y < picture.height(); ++y)
            muted = muted || picture.pixelColor(x, y) == qt::lightColours().muted;
    EXPECT_TRUE(muted);

    rows = Rows::leaves(1);
    reload();
    EXPECT_FALSE(table().hint().isVisible());
    EXPECT_EQ(table().accessibleDescription(), "");
    rows.rows.clear();
    reload();
    EXPECT_TRUE(table().hint().isVisible());
    _screen->setHint("");
    EXPECT_FALSE(table().hint().isVisible());
}

TEST_F(ATable, ShowsTheRingToTheKeyboardAlone)
{
    Rows rows = Rows::leaves(5);
    show(rows);
    tap(table(), 2);
    EXPECT_FALSE(cell(2).look().ringed);
    key(Qt::Key_Down);
    EXPECT_TRUE(cell(3).look().ringed);
}

TEST_F(ATable, TakesTheRingAwayOnAPressAnywhere)
{
    Rows rows = Rows::leaves(5);
    show(rows);
    key(Qt::Key_Down);
    ASSERT_TRUE(cell(0).look().ringed);
    press(navigation().titleBar(), {200, 20});
    EXPECT_FALSE(cell(0).look().ringed);
    release(navigation().titleBar(), {200, 20});
    key(Qt::Key_Down);
    EXPECT_TRUE(cell(1).look().ringed);
    static QPointingDevice* const screen = QTest::createTouchDevice();
    QTest::touchEvent(window().windowHandle(), screen).press(0, {200, 20});
    EXPECT_FALSE(cell(1).look().ringed);
    QTest::touchEvent(window().windowHandle(), screen).release(0, {200, 20});
    EXPECT_EQ(table().current(), 1u) << "the keyboard's place stays";
}

TEST_F(ATable, TellsAScreenReaderOfItsRows)
{
    Rows rows = Rows::leaves(3);
    rows.rows[1].value.reset();
    show(rows);
    auto* list = QAccessible::queryAccessibleInterface(&table());
    ASSERT_NE(list, nullptr);
    EXPECT_EQ(list->role(), QAccessible::List);
    ASSERT_EQ(list->childCount(), 3);
    auto* item = list->child(0);
    EXPECT_EQ(item->role(), QAccessible::ListItem);
    EXPECT_EQ(item->text(QAccessible::Name), "Key 0, Value 0");
    EXPECT_EQ(list->child(1)->text(QAccessible::Name), "Key 1");
    EXPECT_EQ(list->indexOfChild(list->child(2)), 2);
    EXPECT_EQ(item->parent(), list);
    key(Qt::Key_Down);
    EXPECT_TRUE(item->state().focused);
    EXPECT_EQ(list->focusChild(), item);
    rows.rows[0].value = "later";
    reload();
    EXPECT_EQ(item->text(QAccessible::Name), "Key 0, later");
}

TEST_F(ATable, LetsAScreenReaderPressARow)
{
    Rows rows = Rows::leaves(3);
    show(rows);
    auto* item = QAccessible::queryAccessibleInterface(&table())->child(2);
    ASSERT_NE(item->actionInterface(), nullptr);
    item->actionInterface()->doAction(QAccessibleActionInterface::pressAction());
    EXPECT_THAT(rows.selected, ElementsAre(2u));
}

TEST_F(ATable, MayGoBeforeTheCellsThatOthersStillHold)
{
    std::shared_ptr<ReusableCell> held;
    struct Holding final : TableDataSource {
        std::shared_ptr<ReusableCell>& held;
        explicit Holding(std::shared_ptr<ReusableCell>& cell) : held(cell) {}
        std::size_t numberOfRowsInSection(TableView&, std::size_t) override { return 1; }
        std::shared_ptr<ReusableCell> cellForRowAtIndexPath(TableView& table, IndexPath) override
        {
            held = std::make_shared<ReusableCell>(table.makeCell(CellStyle::Default), "held");
            return held;
        }
        void didSelectRowAtIndexPath(TableView&, std::optional<IndexPath>) override {}
    } source(held);
    _screen = screenOf(source);
    navigation().show(*_screen, {"Kestrum"}, Transition::None, false);
    makeVisible();
    ASSERT_NE(held, nullptr);
    _screen.reset();
    held->cell().setAccessory(Accessory::CheckMark);
    EXPECT_EQ(held.use_count(), 1);
}

} // namespace
} // namespace kestrum
