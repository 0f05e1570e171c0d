#include "ui/Panes.h"

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class RecordingDelegate final : public NavigationStackDelegate {
public:
    void willShowViewController(NavigationStack& stack, KestrumPaneController& pane, bool animated) override
    {
        EXPECT_EQ(&stack.topViewController(), &pane);
        told.push_back(pane.path() + (animated ? " animated" : ""));
    }
    std::vector<std::string> told;
};

class NavigationStackTest : public Panes {
protected:
    void SetUp() override
    {
        start(inner("Kestrum", {inner("a", {inner("b", {inner("c")})})}));
        stack->setDelegate(&delegate);
    }
    void open(int levels)
    {
        for (; levels > 0; --levels)
            top().rows.tap(0);
    }

    RecordingDelegate delegate;
};

TEST_F(NavigationStackTest, RootIsShownAtOnceWithoutTheDelegateHearingOfIt)
{
    EXPECT_EQ(top().title(), "Kestrum");
    EXPECT_THAT(toolkit.navigation->transitions, ElementsAre(std::pair(Transition::None, false)));
    EXPECT_THAT(delegate.told, IsEmpty());
}

TEST_F(NavigationStackTest, PushShowsThePaneAndTellsTheDelegateFirst)
{
    open(1);
    EXPECT_EQ(top().title(), "a");
    EXPECT_EQ(toolkit.navigation->titleChanges, 0) << "the titles come with the pane";
    EXPECT_THAT(delegate.told, ElementsAre("/a animated"));
    EXPECT_EQ(toolkit.navigation->transitions.back(), std::pair(Transition::Push, true));
}

TEST_F(NavigationStackTest, BackRevealsThePaneBefore)
{
    open(2);
    toolkit.navigation->pressBack();
    EXPECT_THAT(paths(), ElementsAre("/", "/a"));
    EXPECT_THAT(toolkit.navigation->path, ElementsAre("Kestrum", "a"));
    EXPECT_EQ(top().title(), "a");
    EXPECT_EQ(toolkit.navigation->transitions.back(), std::pair(Transition::Pop, true));
    EXPECT_THAT(delegate.told, ElementsAre("/a animated", "/a/b animated", "/a animated"));
}

TEST_F(NavigationStackTest, BackAtTheRootDoesNothing)
{
    toolkit.navigation->pressBack();
    EXPECT_THAT(paths(), ElementsAre("/"));
    EXPECT_EQ(toolkit.navigation->transitions.size(), 1u);
}

TEST_F(NavigationStackTest, QuickBacksPopOnePaneEach)
{
    open(3);
    toolkit.navigation->pressBack();
    toolkit.navigation->pressBack();
    EXPECT_THAT(paths(), ElementsAre("/", "/a"));
}

TEST_F(NavigationStackTest, PopToAPaneDropsAllThatLiesOverIt)
{
    open(3);
    const std::weak_ptr<KestrumPaneController> middle = stack->viewControllers()[2], last = stack->viewControllers()[3];
    stack->popToViewController(*stack->viewControllers()[1], true);
    EXPECT_THAT(paths(), ElementsAre("/", "/a"));
    EXPECT_EQ(top().title(), "a");
    EXPECT_TRUE(middle.expired());
    EXPECT_TRUE(last.expired());
    EXPECT_EQ(toolkit.navigation->transitions.size(), 5u) << "the panes between are never shown";
}

TEST_F(NavigationStackTest, PopToTheTopOrToAPaneThatIsNotThereDoesNothing)
{
    open(1);
    const auto stranger = pane(nullptr, "/a");
    stack->popToViewController(*stranger, true);
    stack->popToViewController(stack->topViewController(), true);
    EXPECT_THAT(paths(), ElementsAre("/", "/a"));
    EXPECT_EQ(toolkit.navigation->transitions.size(), 2u);
}

TEST_F(NavigationStackTest, PopToRootLeavesTheRootAlone)
{
    open(3);
    stack->popToRootViewController(true);
    EXPECT_THAT(paths(), ElementsAre("/"));
    stack->popToRootViewController(true);
    EXPECT_EQ(toolkit.navigation->transitions.size(), 5u);
}

TEST_F(NavigationStackTest, DismissWithoutASaveScreenDoesNothing)
{
    stack->dismissViewController(true);
    EXPECT_FALSE(toolkit.navigation->presentedAnimated);
}

TEST_F(NavigationStackTest, PoppedPaneWithAnotherOwnerTakesNoTaps)
{
    open(1);
    const auto held = stack->viewControllers()[1];
    toolkit.navigation->pressBack();
    held->didSelectRowAtIndexPath(held->screen().table(), IndexPath{0, 0});
    EXPECT_THAT(paths(), ElementsAre("/"));
    stack.reset();
    held->didSelectRowAtIndexPath(held->screen().table(), IndexPath{0, 0}); // a use after free for the sanitizer
}

TEST_F(NavigationStackTest, PaneWithAnotherOwnerSurvivesItsStack)
{
    open(1);
    const auto held = stack->viewControllers()[1];
    stack.reset();
    held->didSelectRowAtIndexPath(held->screen().table(), IndexPath{0, 0});
    held->reloadWithNode(inner("other"));
    EXPECT_EQ(held->screen().title(), "other");
}

TEST_F(NavigationStackTest, RenamedPaneBelowRenamesTheWayBack)
{
    open(2);
    stack->viewControllers()[1]->reloadWithNode(inner("renamed"));
    EXPECT_THAT(toolkit.navigation->path, ElementsAre("Kestrum", "renamed", "b"));
}

} // namespace
} // namespace kestrum
