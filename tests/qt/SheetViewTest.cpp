#include "frontends/qt/SheetView.h"
#include "QtTest.h"
#include "frontends/qt/Colours.h"

#include <QHeaderView>
#include <QScrollBar>
#include <QScroller>
#include <QSignalSpy>

#include <algorithm>

namespace kestrum {
namespace {

using namespace qt;

class SheetViewTest : public InAWindow, public SheetOwner {
protected:
    bool offers(SheetKind kind, std::optional<std::size_t>) const override
    {
        return kind == SheetKind::Glance || kind == SheetKind::Overview;
    }
    void sheetRequested(SheetKind kind, std::optional<std::size_t>) override { requested.push_back(kind); }
    void sheetLeft() override { sheet.reset(); }
    void columnChosen(std::size_t column) override { chosen.push_back(column); }
    void cursorMoved(std::optional<std::size_t> to) override { cursors.push_back(to); }
    void rangeChosen(std::size_t range) override { ranges.push_back(range); }

    void open()
    {
        pane = screenOf(rows);
        navigation().show(*pane, {"Kestrum"}, Transition::None, false);
        makeVisible();
        sheet = navigation().openSheet(*this);
        sheet->setContents(contents());
    }
    void fill(const SheetContents& contents)
    {
        sheet->setContents(contents);
        QCoreApplication::processEvents(); // Qt lays it out
    }
    static SheetContents contents()
    {
        SheetPart part{.caption = "Neighbours", .facts = {{"PCI", {"7"}}, {"RSRP", {"-90 dBm", 0.5, "good"}}}};
        part.table.columns = {{.heading = "PCI", .isNumeric = true, .isIdentity = true},
                              {.heading = "RSRP", .unit = "dBm", .isNumeric = true, .hasBars = true}};
        part.table.rows = {{.identity = "a", .cells = {{"112"}, {"-90"}}, .isReference = true},
                           {.identity = "b", .cells = {{"88"}, {"-95", 0.4, "fair"}}, .moved = SheetRow::Moved::Up}};
        part.table.sort = {1, true};
        return {.title = "A list", .parts = {part}, .status = "Updated now", .canSort = true};
    }
    static std::vector<SheetRow> rowsOf(std::size_t count)
    {
        std::vector<SheetRow> rows;
        for (std::size_t i = 0; i < count; ++i)
            rows.push_back({.identity = std::to_string(i), .cells = {{std::to_string(i)}, {"-95"}}});
        return rows;
    }
    QPoint placeOf(const QWidget& part) { return part.mapTo(navigation().insight(), QPoint()); }
    SheetTableView& shownTable() { return navigation().insight()->parts().front()->table(); }

    Rows rows = Rows::leaves(3);
    std::unique_ptr<TableScreen> pane;
    std::unique_ptr<Sheet> sheet;
    std::vector<SheetKind> requested;
    std::vector<std::size_t> chosen, ranges;
    std::vector<std::optional<std::size_t>> cursors;
};

TEST_F(SheetViewTest, ShowsHeadingsRowsAndWordsAsText)
{
    open();
    EXPECT_EQ(navigation().insight()->title(), "A list");
    EXPECT_EQ(navigation().insight()->status(), "Updated now");
    EXPECT_EQ(shownTable().horizontalHeaderItem(1)->text(), QStringLiteral("RSRP dBm ↓"));
    EXPECT_EQ(shownTable().item(0, 0)->text(), QStringLiteral("Serving 112"));
    EXPECT_EQ(shownTable().item(1, 0)->text(), QStringLiteral("↑ 88"));
    EXPECT_EQ(shownTable().item(1, 1)->text(), QStringLiteral("-95  fair"));
}

TEST_F(SheetViewTest, TakesAllInputAndClosesByEscapeAndTheBackButton)
{
    open();
    EXPECT_FALSE(table().isEnabled());
    QTest::keyClick(navigation().insight(), Qt::Key_Escape);
    EXPECT_EQ(navigation().insight(), nullptr);
    EXPECT_TRUE(table().isEnabled());
    EXPECT_EQ(backs, 0);
    sheet = navigation().openSheet(*this);
    click(navigation().insight()->back());
    EXPECT_EQ(navigation().insight(), nullptr);
}

TEST_F(SheetViewTest, AHeadingThatIsPressedSorts)
{
    open();
    auto* header = shownTable().horizontalHeader();
    QTest::mouseClick(header->viewport(), Qt::LeftButton, {},
                      {header->sectionViewportPosition(1) + 5, header->height() / 2});
    EXPECT_THAT(chosen, testing::ElementsAre(1u));
}

TEST_F(SheetViewTest, AFingerScrollsATableAndPressesNothing)
{
    open();
    auto longer = contents();
    longer.canSort = false;
    longer.parts[0].table.rows = rowsOf(60);
    fill(longer);
    auto& viewport = *shownTable().viewport();
    pressAndMove(viewport, {100, 300}, {100, 200});
    EXPECT_TRUE(QTest::qWaitFor([&] { return shownTable().verticalScrollBar()->value() > 80; }));
    release(viewport, {100, 200});
    QScroller::scroller(&viewport)->stop();
    const int moved = shownTable().verticalScrollBar()->value();
    click(viewport, {100, 200});
    QTest::mouseMove(window().windowHandle(), viewport.mapTo(&window(), QPoint(100, 100)));
    EXPECT_EQ(shownTable().verticalScrollBar()->value(), moved) << "no finger is down";
}

TEST_F(SheetViewTest, AFingerOnATableOfSeveralScrollsTheSheet)
{
    open();
    auto several = contents();
    several.parts[0].table.rows = rowsOf(30);
    several.parts.push_back(several.parts[0]);
    fill(several);
    const int before = placeOf(shownTable()).y();
    pressAndMove(*shownTable().viewport(), {100, 300}, {100, 200});
    EXPECT_TRUE(QTest::qWaitFor([&] { return placeOf(shownTable()).y() < before - 80; }));
    release(*navigation().insight(), {100, 300});
}

TEST_F(SheetViewTest, WhatIdentifiesARowStaysInView)
{
    open();
    auto wide = contents();
    for (int i = 0; i < 8; ++i)
        wide.parts[0].table.columns.push_back({.heading = "A long heading"});
    for (auto& row : wide.parts[0].table.rows)
        row.cells.resize(10);
    fill(wide);
    auto& shown = shownTable();
    const int identity = shown.columnWidth(0), under = shown.horizontalHeader()->height();
    const QRect cells(0, under, identity - 1, 2 * 36);
    const QImage before = shown.grab(cells).toImage();
    EXPECT_FALSE(shown.frozen().isVisible());
    shown.horizontalScrollBar()->setValue(200);
    EXPECT_TRUE(shown.frozen().isVisible());
    EXPECT_EQ(shown.frozen().width(), identity);
    EXPECT_EQ(shown.grab(cells).toImage(), before);
    click(shown.frozen(), {10, 10});
    EXPECT_THAT(chosen, testing::ElementsAre(0u));
    for (int i = 0; i < 100; ++i)
        QTest::keyClick(navigation().insight(), Qt::Key_Left);
    EXPECT_FALSE(shown.frozen().isVisible());
    QTest::keyClick(navigation().insight(), Qt::Key_Right);
    EXPECT_TRUE(shown.frozen().isVisible());
}

TEST_F(SheetViewTest, ShowsWhereALongTableIs)
{
    open();
    auto many = contents();
    many.parts[0].table.rows = rowsOf(100);
    fill(many);
    auto& bar = *shownTable().verticalScrollBar();
    const auto isMarked = [&](int y) {
        return bar.grab().toImage().pixelColor(bar.width() / 2, y) == lightColours().accent;
    };
    EXPECT_TRUE(isMarked(5));
    EXPECT_FALSE(isMarked(bar.height() - 5));
    bar.setValue(bar.maximum());
    EXPECT_FALSE(isMarked(5));
    EXPECT_TRUE(isMarked(bar.height() - 5));
}

TEST_F(SheetViewTest, ChangesOnlyTheRowsThatDiffer)
{
    open();
    auto many = contents();
    many.parts[0].table.rows = rowsOf(1000);
    fill(many);
    shownTable().verticalScrollBar()->setValue(360);
    const QSignalSpy changed(shownTable().model(), &QAbstractItemModel::dataChanged);
    const QSignalSpy inserted(shownTable().model(), &QAbstractItemModel::rowsInserted);
    fill(many);
    EXPECT_EQ(changed.count(), 0);
    auto& rows = many.parts[0].table.rows;
    rows.insert(rows.begin(), {.identity = "new", .cells = {{"new"}, {"-1"}}});
    rows.pop_back();
    fill(many);
    EXPECT_EQ(inserted.count(), 1);
    for (const auto& each : changed)
        EXPECT_EQ(each[1].toModelIndex().row(), 0);
    EXPECT_EQ(shownTable().item(0, 0)->text(), QStringLiteral("new"));
    EXPECT_EQ(shownTable().item(999, 0)->text(), QStringLiteral("998"));
    EXPECT_EQ(shownTable().verticalScrollBar()->value(), 360 + 36) << "the same rows are in view";
}

TEST_F(SheetViewTest, ANewOrderOfTheRowsDoesNotScroll)
{
    open();
    auto many = contents();
    many.parts[0].table.rows = rowsOf(100);
    fill(many);
    shownTable().verticalScrollBar()->setValue(360);
    std::ranges::reverse(many.parts[0].table.rows);
    fill(many);
    EXPECT_EQ(shownTable().verticalScrollBar()->value(), 360);
    EXPECT_EQ(shownTable().rowCount(), 100);
    EXPECT_EQ(shownTable().item(0, 0)->text(), QStringLiteral("99"));
}

TEST_F(SheetViewTest, ShowsLinesOfTextAboveTheFacts)
{
    open();
    auto said = contents();
    said.parts[0].lines = {std::string(300, 'a') + " " + std::string(20, 'b'), "Second"};
    fill(said);
    auto& part = *navigation().insight()->parts().front();
    EXPECT_TRUE(part.lines().text().endsWith(QStringLiteral("b\n\nSecond")));
    EXPECT_LE(part.lines().geometry().bottom(), part.facts().geometry().top());
}

TEST_F(SheetViewTest, KeysOpenThem)
{
    open();
    sheet.reset();
    QTest::keyClicks(&table(), QStringLiteral("vo"));
    EXPECT_THAT(requested, testing::ElementsAre(SheetKind::Glance, SheetKind::Overview));
}

TEST_F(SheetViewTest, AScreenReaderHasTheTable)
{
    open();
    auto* table = QAccessible::queryAccessibleInterface(&shownTable());
    ASSERT_NE(table->tableInterface(), nullptr);
    EXPECT_EQ(table->tableInterface()->rowCount(), 2);
    EXPECT_EQ(table->tableInterface()->cellAt(1, 1)->text(QAccessible::Name), QStringLiteral("-95  fair"));
}

TEST_F(SheetViewTest, PartsComeAndGoAndTheWindowMayEndFirst)
{
    open();
    auto changed = contents();
    changed.parts.push_back(changed.parts.front());
    sheet->setContents(changed);
    changed.parts.clear();
    sheet->setContents(changed);
    sheet->setContents(contents());
    EXPECT_EQ(navigation().insight()->parts().size(), 1u);
}

} // namespace
} // namespace kestrum
