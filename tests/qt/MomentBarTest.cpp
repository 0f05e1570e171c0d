#include "QtTest.h"

#include "frontends/qt/ContextMenu.h"
#include "frontends/qt/Motion.h"

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

/// A window of 360x640, where the panes can stand still.
class AMomentBar : public InAWindow {
protected:
    AMomentBar()
    {
        qt::setMotionWanted(false);
        _screen = screenOf(rows);
        _screen->setToolbarItems(
            {ActivityIndicatorItem{false}, LabelItem{kBack, systemFont(14)}, FlexibleSpaceItem{}, SaveItem{[] {}}},
            true);
        navigation().show(*_screen, {"Kestrum"}, Transition::None, false);
        makeVisible();
        window().resize(360, 640);
    }
    ~AMomentBar() override { qt::setMotionWanted(true); }

    qt::MomentBar& bar() { return navigation().momentBar(); }
    static constexpr const char* kBack = "06:05:40, frozen since 06:05:44";

    Rows rows = Rows::leaves(40);
    std::unique_ptr<TableScreen> _screen;
};

TEST_F(AMomentBar, IsThereOnlyWhileThePanesStandStill)
{
    EXPECT_FALSE(bar().isVisible());
    const int whole = table().height();
    navigation().setFrozen(FrozenMoment{"Frozen since 06:05:44", true, false});
    EXPECT_TRUE(bar().isVisible());
    EXPECT_TRUE(bar().earlier().isVisible());
    EXPECT_FALSE(bar().later().isVisible());
    EXPECT_EQ(table().height(), whole - bar().height());
    EXPECT_EQ(bar().geometry().bottom() + 1, navigation().toolbar()->geometry().top());
    navigation().setFrozen(std::nullopt);
    EXPECT_FALSE(bar().isVisible());
    EXPECT_EQ(table().height(), whole);
}

TEST_F(AMomentBar, ReachesOtherMomentsAndTheModemByTouchAlone)
{
    navigation().setFrozen(FrozenMoment{kBack, true, true});
    for (qt::Button* each : {&bar().earlier(), &bar().later(), &bar().live()}) {
        EXPECT_GE(each->height(), 44);
        EXPECT_GE(each->width(), 44);
        click(*each);
    }
    EXPECT_THAT(looks, ElementsAre(Look::Earlier, Look::Later, Look::Freeze));
    const auto& status = *static_cast<qt::LineLabel*>(navigation().toolbar()->widgetAt(1));
    EXPECT_FALSE(status.isCut()) << "the moment is whole beside Save";
}

TEST_F(AMomentBar, IsOpenedFromTheMenuOfARow)
{
    for (const char* text : {"Freeze", "Live"}) {
        looks.clear();
        click(*table().viewport(), middleOf(table(), 1), Qt::RightButton);
        auto* menu = dynamic_cast<qt::ContextMenu*>(QApplication::activePopupWidget());
        ASSERT_NE(menu, nullptr);
        auto* action = menu->actions().at(3);
        EXPECT_EQ(action->text(), text);
        QTest::mouseClick(menu, Qt::LeftButton, {}, menu->actionGeometry(action).center());
        EXPECT_THAT(looks, ElementsAre(Look::Freeze));
        navigation().setFrozen(FrozenMoment{kBack, true, true});
    }
}

TEST_F(AMomentBar, NamesTheMomentToAScreenReader)
{
    navigation().setFrozen(FrozenMoment{kBack, true, true});
    auto* interface = QAccessible::queryAccessibleInterface(&bar());
    EXPECT_EQ(interface->text(QAccessible::Name), kBack);
    EXPECT_EQ(interface->childCount(), 3);
}

TEST_F(AMomentBar, HidesNoButtonUnderAPressThatMeansAnother)
{
    navigation().setFrozen(FrozenMoment{kBack, true, true});
    bar().earlier().setFocus();
    navigation().setFrozen(FrozenMoment{kBack, false, true});
    EXPECT_TRUE(table().hasFocus());
    bar().live().setFocus();
    navigation().setFrozen(std::nullopt);
    EXPECT_TRUE(table().hasFocus());
}

} // namespace
} // namespace kestrum
