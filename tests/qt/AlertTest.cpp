#include "QtTest.h"

namespace kestrum {
namespace {

using testing::IsEmpty;

class AnAlert : public InAWindow {
protected:
    AnAlert() : _screen(screenOf(rows)) { navigation().show(*_screen, {"Kestrum"}, Transition::None, false); }

    static void show(const char* message) { toolkit().showAlert("File Error", message, "Close"); }
    qt::Alert* alert() { return window().alert(); }

    Rows rows = Rows::leaves(3);
    std::unique_ptr<TableScreen> _screen;
};

TEST_F(AnAlert, SaysWhatItWasGiven)
{
    makeVisible();
    show("Unable to write file to disk");
    ASSERT_NE(alert(), nullptr);
    EXPECT_EQ(alert()->title(), "File Error");
    EXPECT_EQ(alert()->message(), "Unable to write file to disk");
    EXPECT_EQ(alert()->button().text(), "Close");
    auto* spoken = QAccessible::queryAccessibleInterface(alert());
    EXPECT_EQ(spoken->text(QAccessible::Name), "File Error");
    EXPECT_EQ(spoken->text(QAccessible::Description), "Unable to write file to disk");
    click(alert()->button());
    EXPECT_EQ(alert(), nullptr);
}

TEST_F(AnAlert, IsClosedByEnterAndByEscape)
{
    makeVisible();
    for (const auto key : {Qt::Key_Return, Qt::Key_Escape, Qt::Key_Space}) {
        show("Unable to write file to disk");
        ASSERT_NE(alert(), nullptr);
        QTest::keyClick(QApplication::focusWidget(), key);
        EXPECT_EQ(alert(), nullptr) << key;
    }
}

TEST_F(AnAlert, KeepsInputFromWhatItCovers)
{
    makeVisible();
    show("Unable to write file to disk");
    click(window(), {100, 48 + 22});
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Down);
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
    EXPECT_EQ(QApplication::focusWidget(), &alert()->button());
    EXPECT_THAT(rows.selected, IsEmpty());
    EXPECT_EQ(table().current(), std::nullopt);
}

TEST_F(AnAlert, GivesTheKeyboardBack)
{
    makeVisible();
    show("Unable to write file to disk");
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);
    EXPECT_TRUE(table().hasFocus());
}

TEST_F(AnAlert, WaitsForTheOneBefore)
{
    makeVisible();
    show("first");
    show("second");
    EXPECT_EQ(alert()->message(), "first");
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);
    ASSERT_NE(alert(), nullptr);
    EXPECT_EQ(alert()->message(), "second");
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);
    EXPECT_EQ(alert(), nullptr);
}

TEST_F(AnAlert, WaitsForTheWindow)
{
    show("early");
    EXPECT_EQ(alert(), nullptr);
    makeVisible();
    ASSERT_NE(alert(), nullptr);
    EXPECT_EQ(alert()->message(), "early");
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);
}

} // namespace
} // namespace kestrum
