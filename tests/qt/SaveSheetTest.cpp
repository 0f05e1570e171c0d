#include "QtTest.h"

#include "frontends/qt/Motion.h"

namespace kestrum {
namespace {

struct Owner final : SaveInterfaceOwner {
    std::vector<std::string> rows{"Snapshot (2026-11-16 06:05:42 +0000)", "DLF binary (1024 bytes)"};
    std::unique_ptr<SaveInterface> interface = toolkit().loadSaveInterface(*this);
    int saves = 0, cancels = 0, backgrounds = 0, returns = 0;
    std::vector<std::size_t> selected;

    std::size_t numberOfRowsInSection(TableView&, std::size_t) override { return rows.size(); }
    std::shared_ptr<ReusableCell> cellForRowAtIndexPath(TableView& table, IndexPath indexPath) override
    {
        auto cell = table.dequeueReusableCell("entry");
        if (!cell)
            cell = std::make_shared<ReusableCell>(table.makeCell(CellStyle::Default), "entry");
        cell->cell().textLabel().setFont({"Helvetica", 13});
        cell->cell().textLabel().setText(rows[indexPath.row]);
        cell->cell().setAccessory(Accessory::CheckMark);
        return cell;
    }
    void didSelectRowAtIndexPath(TableView&, std::optional<IndexPath> indexPath) override
    {
        selected.push_back(indexPath.value().row);
        interface->saveDescription().resignFirstResponder();
    }
    void savePressed() override { ++saves; }
    void cancelPressed() override { ++cancels; }
    void backgroundTouched() override
    {
        ++backgrounds;
        interface->saveDescription().resignFirstResponder();
    }
    bool textFieldShouldReturn() override
    {
        ++returns;
        interface->saveDescription().resignFirstResponder();
        return true;
    }
};

class ASaveSheet : public InAWindow {
protected:
    ASaveSheet() : _screen(screenOf(rows))
    {
        qt::setMotionWanted(false);
        navigation().show(*_screen, {"Kestrum", "Serving Cell"}, Transition::None, false);
    }
    ~ASaveSheet() override { qt::setMotionWanted(true); }

    void present()
    {
        makeVisible();
        owner.interface->saveContentTable().sizeToFit();
        navigation().present(*owner.interface, true);
    }
    qt::SaveSheet& sheet() { return *navigation().sheet(); }

    Rows rows = Rows::leaves(3);
    std::unique_ptr<TableScreen> _screen;
    Owner owner;
};

TEST_F(ASaveSheet, ListsWhatIsSavedWithCheckMarks)
{
    present();
    const auto cells = sheet().table().cellsInView();
    ASSERT_EQ(cells.size(), 2u);
    EXPECT_EQ(cells[0]->spoken(), "Snapshot (2026-11-16 06:05:42 +0000)");
    EXPECT_EQ(cells[1]->spoken(), "DLF binary (1024 bytes)");
    EXPECT_EQ(cells[1]->accessory(), Accessory::CheckMark);
    const auto state = QAccessible::queryAccessibleInterface(cells[1])->state();
    EXPECT_TRUE(state.checkable);
    EXPECT_TRUE(state.checked);
}

TEST_F(ASaveSheet, IsEmptyWithNothingToSave)
{
    owner.rows.clear();
    present();
    EXPECT_TRUE(sheet().table().cellsInView().empty());
    click(sheet().save());
    EXPECT_EQ(owner.saves, 1);
}

TEST_F(ASaveSheet, TakesADescription)
{
    present();
    EXPECT_EQ(owner.interface->saveDescription().text(), "");
    ASSERT_TRUE(sheet().description().hasFocus());
    QTest::keyClicks(&sheet().description(), "roof, north");
    EXPECT_EQ(owner.interface->saveDescription().text(), "roof, north");
}

TEST_F(ASaveSheet, ClosesTheKeyboardOnReturnAndDoesNotSave)
{
    present();
    QTest::keyClick(&sheet().description(), Qt::Key_Return);
    EXPECT_EQ(owner.returns, 1);
    EXPECT_EQ(owner.saves, 0);
    EXPECT_FALSE(sheet().description().hasFocus());
}

TEST_F(ASaveSheet, StillAnswersKeysAfterTheKeyboardWasClosed)
{
    present();
    QTest::keyClick(&sheet().description(), Qt::Key_Return);
    QTest::keyClick(window().windowHandle(), Qt::Key_Tab);
    EXPECT_TRUE(sheet().description().hasFocus());
    QTest::keyClick(&sheet().description(), Qt::Key_Return);
    QTest::keyClick(window().windowHandle(), Qt::Key_Escape);
    EXPECT_EQ(owner.cancels, 1);
}

TEST_F(ASaveSheet, SavesByControlSButNotByTheHeldKeyThatOpenedIt)
{
    present();
    QKeyEvent held(QEvent::KeyPress, Qt::Key_S, Qt::ControlModifier, {}, true);
    QApplication::sendEvent(&sheet().description(), &held);
    EXPECT_EQ(owner.saves, 0);
    QTest::keyClick(&sheet().description(), Qt::Key_S, Qt::ControlModifier);
    EXPECT_EQ(owner.saves, 1);
}

TEST_F(ASaveSheet, ClosesTheKeyboardOnATouchOutsideTheField)
{
    present();
    click(window(), {200, 5});
    EXPECT_EQ(owner.backgrounds, 1);
    EXPECT_FALSE(sheet().description().hasFocus());
    sheet().description().setFocus();
    click(sheet().card(), {200, 60});
    EXPECT_EQ(owner.backgrounds, 2);
    click(sheet().description());
    EXPECT_EQ(owner.backgrounds, 2);
}

TEST_F(ASaveSheet, ClosesTheKeyboardOnATouchOfARow)
{
    present();
    tap(sheet().table(), 1);
    EXPECT_EQ(owner.selected, std::vector<std::size_t>{1});
    EXPECT_FALSE(sheet().description().hasFocus());
}

TEST_F(ASaveSheet, SavesAndCancelsByMouseAndByKeyboard)
{
    present();
    click(sheet().save());
    EXPECT_EQ(owner.saves, 1);
    click(sheet().cancel());
    EXPECT_EQ(owner.cancels, 1);
    QTest::keyClick(&sheet().description(), Qt::Key_Escape);
    EXPECT_EQ(owner.cancels, 2);
    sheet().description().setFocus();
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
    ASSERT_EQ(QApplication::focusWidget(), &sheet().save());
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);
    EXPECT_EQ(owner.saves, 2);
}

TEST_F(ASaveSheet, KeepsTheKeyboardInside)
{
    present();
    for (int i = 0; i < 9; ++i) {
        QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
        ASSERT_TRUE(sheet().isAncestorOf(QApplication::focusWidget())) << i;
    }
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Escape);
    EXPECT_EQ(owner.cancels, 1);
    EXPECT_EQ(backs, 0);
}

TEST_F(ASaveSheet, ReachesTheWholeWindowAndFollowsItsSize)
{
    present();
    owner.interface->setFrame(toolkit().mainScreenApplicationFrame());
    EXPECT_EQ(sheet().geometry(), window().rect());
    window().resize(700, 600);
    EXPECT_EQ(sheet().geometry(), QRect(0, 0, 700, 600));
    EXPECT_EQ(sheet().card().width(), 560);
}

TEST_F(ASaveSheet, GivesTheKeyboardBackToThePane)
{
    present();
    navigation().dismiss(true);
    owner.interface.reset();
    EXPECT_EQ(navigation().sheet(), nullptr);
    EXPECT_TRUE(table().hasFocus());
    tap(table(), 1);
    EXPECT_EQ(rows.selected, std::vector<std::size_t>{1});
}

TEST_F(ASaveSheet, LeavesInAMovementThatOutlivesIt)
{
    qt::setMotionWanted(true);
    present();
    ASSERT_TRUE(navigation().isMoving());
    navigation().dismiss(true);
    owner.interface.reset();
    EXPECT_TRUE(table().hasFocus());
    EXPECT_TRUE(QTest::qWaitFor([&] { return !navigation().isMoving(); }));
}

TEST_F(ASaveSheet, IsNeverCoveredByWhatHappensUnderIt)
{
    present();
    const auto picture = [&] { return window().grab().toImage(); };
    const QImage before = picture();
    const QPoint saveBelow(360, 844 - 24);
    ASSERT_TRUE(&sheet() == window().childAt(saveBelow) || sheet().isAncestorOf(window().childAt(saveBelow)));

    Rows others = Rows::leaves(1);
    const auto other = screenOf(others);
    other->setToolbarItems(
        {ActivityIndicatorItem{true}, LabelItem{"Connecting...", systemFont(14)}, FlexibleSpaceItem{}, SaveItem{[] {}}},
        true);
    for (const auto transition : {Transition::Push, Transition::Pop, Transition::None}) {
        navigation().show(transition == Transition::Pop ? *_screen : *other, {"Kestrum"}, transition, true);
        navigation().setToolbarHidden(true);
        navigation().setToolbarHidden(false);
        EXPECT_TRUE(sheet().isAncestorOf(window().childAt(saveBelow)));
        EXPECT_EQ(picture().copy(sheet().card().geometry()), before.copy(sheet().card().geometry()));
    }
    navigation().show(*_screen, {"Kestrum"}, Transition::None, false);
}

TEST_F(ASaveSheet, KeepsTheKeyboardWhenThePaneUnderItChanges)
{
    present();
    Rows others = Rows::leaves(1);
    const auto other = screenOf(others);
    navigation().show(*other, {"Kestrum"}, Transition::Pop, true);
    EXPECT_TRUE(sheet().description().hasFocus());
    EXPECT_FALSE(table().isEnabled());
    navigation().dismiss(true);
    EXPECT_TRUE(table().hasFocus());
    navigation().show(*_screen, {"Kestrum"}, Transition::None, false);
}

TEST_F(ASaveSheet, ClosesBehindAnAlert)
{
    present();
    toolkit().showAlert("File Error", "Unable to write file to disk", "Close");
    navigation().dismiss(true);
    owner.interface.reset();
    ASSERT_NE(window().alert(), nullptr);
    EXPECT_EQ(QApplication::focusWidget(), &window().alert()->button());
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);
    EXPECT_TRUE(table().hasFocus());
}

} // namespace
} // namespace kestrum
