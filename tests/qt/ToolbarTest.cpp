#include "QtTest.h"

namespace kestrum {
namespace {

class AToolbar : public testing::Test {
protected:
    AToolbar()
    {
        _bar.resize(390, 48);
        _bar.show();
    }
    void set(bool loading, const std::string& status, bool save = true)
    {
        std::vector<ToolbarItem> items{ActivityIndicatorItem{loading}, LabelItem{status, systemFont(14)},
                                       FlexibleSpaceItem{}};
        if (save)
            items.push_back(SaveItem{[this] { ++saves; }});
        _bar.setItems(std::move(items));
    }
    QWidget& at(std::size_t item) { return *_bar.widgetAt(item); }

    qt::Toolbar _bar;
    int saves = 0;
};

TEST_F(AToolbar, KeepsTheWidgetsOfItemsThatStay)
{
    set(false, "Updated 2026-11-16 at 06:05:42");
    const auto* spinner = &at(0);
    const auto* label = &at(1);
    const auto* save = &at(3);
    set(false, "Updated 2026-11-16 at 06:05:42");
    set(true, "Connecting...");
    EXPECT_EQ(&at(0), spinner);
    EXPECT_EQ(&at(1), label);
    EXPECT_EQ(&at(3), save);
}

TEST_F(AToolbar, DoesNotLoseAHeldSaveToARefresh)
{
    set(false, "Updated 2026-11-16 at 06:05:42");
    QTest::mousePress(&at(3), Qt::LeftButton);
    set(false, "Updated 2026-11-16 at 06:05:44");
    QTest::mouseRelease(&at(3), Qt::LeftButton);
    EXPECT_EQ(saves, 1);
}

TEST_F(AToolbar, ShowsTheSpinnerOnlyWhileItRuns)
{
    set(true, "Connecting...");
    EXPECT_TRUE(at(0).isVisible());
    EXPECT_EQ(at(0).size(), QSize(20, 20));
    const int beside = at(1).x();
    set(false, "Updated");
    EXPECT_FALSE(at(0).isVisible());
    EXPECT_EQ(at(1).x(), 10);
    EXPECT_GT(beside, 30);
}

TEST_F(AToolbar, KeepsSaveAtTheRightEdgeHoweverLongTheStatusIs)
{
    set(true, std::string(500, 'W'));
    EXPECT_EQ(at(3).geometry().right() + 1, 390);
    EXPECT_LE(at(1).geometry().right(), at(3).x());
    EXPECT_EQ(at(1).accessibleName().size(), 500);
}

TEST_F(AToolbar, HasNoSaveWhereItIsNotOffered)
{
    set(false, "Updated", false);
    EXPECT_EQ(_bar.widgetAt(3), nullptr);
    set(false, "Updated", true);
    ASSERT_NE(_bar.widgetAt(3), nullptr);
    set(false, "Updated", false);
    EXPECT_EQ(_bar.widgetAt(3), nullptr);
}

TEST_F(AToolbar, CanBeReplacedBySavesOwnAction)
{
    _bar.setItems({SaveItem{[this] {
        ++saves;
        _bar.setItems({});
    }}});
    QTest::mouseClick(&at(0), Qt::LeftButton);
    EXPECT_EQ(saves, 1);
    EXPECT_EQ(_bar.widgetAt(0), nullptr);
}

TEST_F(AToolbar, SavesByKeyboard)
{
    set(false, "Updated");
    at(3).setFocus();
    QTest::keyClick(&at(3), Qt::Key_Return);
    QTest::keyClick(&at(3), Qt::Key_Space);
    EXPECT_EQ(saves, 2);
}

} // namespace
} // namespace kestrum
