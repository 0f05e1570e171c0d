#include "ui/Panes.h"

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class KestrumPaneControllerTest : public Panes {
protected:
    /// An inner row, a leaf, an inner row without children.
    static Node mixed()
    {
        return inner("Kestrum",
                     {inner("Serving Cell", {leaf("RSSI", "-80 dBm")}), leaf("State", "Idle"), inner("Neighbors")});
    }
};

TEST_F(KestrumPaneControllerTest, WithoutANodeTheTitleIsKestrumAndThereAreNoRows)
{
    start(nullptr);
    EXPECT_EQ(top().title(), "Kestrum");
    EXPECT_EQ(top().rows.rowCount(), 0u);
    EXPECT_THAT(top().rows.texts(), IsEmpty());
}

TEST_F(KestrumPaneControllerTest, BeginsLoadingWithoutAStatus)
{
    start(nullptr);
    EXPECT_EQ(top().status(), "");
    EXPECT_TRUE(top().isLoading());
}

TEST_F(KestrumPaneControllerTest, InnerRowsHaveADisclosureMarkAndLeavesTheirValue)
{
    start(mixed());
    EXPECT_THAT(top().rows.texts(), ElementsAre("Serving Cell", "State: Idle", "Neighbors"));
    EXPECT_EQ(top().rows.row(0).accessory, Accessory::DisclosureIndicator);
    EXPECT_EQ(top().rows.row(1).accessory, Accessory::None);
    EXPECT_EQ(top().rows.row(2).accessory, Accessory::DisclosureIndicator);
    EXPECT_EQ(top().rows.reusable(0).reuseIdentifier(), "KestrumPaneControllerCell");
    EXPECT_EQ(top().rows.reusable(1).reuseIdentifier(), "KestrumPaneControllerCell");
}

TEST_F(KestrumPaneControllerTest, RowsAreLaidOutInTheTablesWidth)
{
    toolkit.record.tableWidth = 320;
    start(mixed());
    // "Serving Cell" and its mark, "State" 45 wide, "Idle" 36 wide in bold.
    EXPECT_EQ(top().rows.row(0).key()->frame(), (Rect{10, 13, 108, 18}));
    EXPECT_EQ(top().rows.row(1).key()->frame(), (Rect{10, 13, 45, 18}));
    EXPECT_EQ(top().rows.row(1).value()->frame(), (Rect{284, 13, 36, 18}));
}

TEST_F(KestrumPaneControllerTest, RowsFollowTheTablesWidth)
{
    start(mixed());
    top().rows.setWidth(500);
    EXPECT_EQ(top().rows.cellsMade, 3) << "the cells of the narrower table serve again";
    EXPECT_EQ(top().rows.row(1).value()->frame(), (Rect{464, 13, 36, 18}));
    EXPECT_EQ(top().rows.row(1).strip()->frame(), (Rect{0, 0, 500, 50}));
}

TEST_F(KestrumPaneControllerTest, LeafThatFillsItsRowExactlyHasItsValueBehindTheKey)
{
    toolkit.record.tableWidth = 330;
    start(inner("Kestrum", {leaf(std::string(10, 'k'), std::string(20, 'v'))}));
    EXPECT_EQ(top().rows.row(0).value()->frame(), (Rect{150, 13, 180, 18}));
    EXPECT_EQ(top().rows.row(0).strip()->contentSize, (Size{330, 50}));
}

TEST_F(KestrumPaneControllerTest, LongValueScrollsSideways)
{
    start(inner("Kestrum", {leaf("RRC", std::string(60, 'v'))}));
    EXPECT_EQ(top().rows.row(0).strip()->contentSize, (Size{320 + 27 + 540, 50}));
}

TEST_F(KestrumPaneControllerTest, InnerRowOpensAPaneUnderItsPath)
{
    start(mixed());
    top().rows.tap(0);
    EXPECT_THAT(paths(), ElementsAre("/", "/Serving Cell"));
    EXPECT_EQ(top().title(), "Serving Cell");
    EXPECT_THAT(top().rows.texts(), ElementsAre("RSSI: -80 dBm"));
    EXPECT_THAT(toolkit.navigation->path, ElementsAre("Kestrum", "Serving Cell"));
    EXPECT_EQ(toolkit.navigation->transitions.back(), std::pair(Transition::Push, true));
}

TEST_F(KestrumPaneControllerTest, PathsJoinWithOneSlashWhateverTheNamesHold)
{
    start(inner("Kestrum", {inner("", {inner("a/b", {inner("/")})})}));
    top().rows.tap(0);
    EXPECT_EQ(top().title(), "");
    top().rows.tap(0);
    top().rows.tap(0);
    EXPECT_EQ(top().title(), "/");
    EXPECT_THAT(paths(), ElementsAre("/", "/(empty)", "/(empty)/a/b", "/(empty)/a/b/(empty)"));
}

TEST_F(KestrumPaneControllerTest, InnerRowWithoutChildrenOpensAnEmptyPane)
{
    start(mixed());
    top().rows.tap(2);
    EXPECT_EQ(top().title(), "Neighbors");
    EXPECT_THAT(top().rows.texts(), IsEmpty());
}

TEST_F(KestrumPaneControllerTest, OpenedPaneStartsWithTheStatusOfThePaneItWasOpenedFrom)
{
    start(mixed());
    stack->topViewController().setStatus("Updated 2026-11-16 at 06:05:42", false);
    top().rows.tap(0);
    EXPECT_EQ(top().status(), "Updated 2026-11-16 at 06:05:42");
    EXPECT_FALSE(top().isLoading());

    stack->topViewController().setStatus("Connecting...", true);
    toolkit.navigation->pressBack();
    EXPECT_EQ(top().status(), "Updated 2026-11-16 at 06:05:42") << "each pane has a separate status";
}

TEST_F(KestrumPaneControllerTest, LeafOnlyLosesItsSelection)
{
    start(mixed());
    top().rows.tap(1);
    EXPECT_THAT(paths(), ElementsAre("/"));
    EXPECT_EQ(top().rows.selected, std::nullopt);
    EXPECT_EQ(top().rows.deselectedAnimated, false);
}

TEST_F(KestrumPaneControllerTest, NoRowSelectsNothing)
{
    start(mixed());
    stack->topViewController().didSelectRowAtIndexPath(top().rows, std::nullopt);
    EXPECT_THAT(paths(), ElementsAre("/"));
    EXPECT_EQ(top().rows.deselectedAnimated, std::nullopt);
}

TEST_F(KestrumPaneControllerTest, TapOnARemovedRowDoesNothing)
{
    start(mixed());
    stack->topViewController().reloadWithNode(inner("Kestrum", {inner("Serving Cell")}));
    top().rows.tap(2);
    EXPECT_THAT(paths(), ElementsAre("/"));
    EXPECT_EQ(top().rows.deselectedAnimated, std::nullopt);
}

TEST_F(KestrumPaneControllerTest, RemovedRowIsDrawnBlank)
{
    start(mixed());
    auto& controller = stack->topViewController();
    controller.reloadWithNode(nullptr);
    // A table that has not been told of the new node may still ask.
    struct OneMore final : TableDataSource {
        explicit OneMore(TableDataSource& of) : source(of) {}
        std::size_t numberOfRowsInSection(TableView&, std::size_t) override { return 1; }
        std::shared_ptr<ReusableCell> cellForRowAtIndexPath(TableView& table, IndexPath at) override
        {
            return source.cellForRowAtIndexPath(table, at);
        }
        void didSelectRowAtIndexPath(TableView&, std::optional<IndexPath>) override {}
        TableDataSource& source;
    } source(controller);
    RecordingTable table(toolkit.record, source);
    table.appear(true);
    EXPECT_THAT(table.texts(), ElementsAre(""));
    EXPECT_EQ(table.row(0).accessory, Accessory::None);
}

TEST_F(KestrumPaneControllerTest, TapOnAPaneThatIsCoveredOpensNothing)
{
    start(mixed());
    auto& below = top();
    below.rows.tap(0);
    below.rows.tap(2);
    EXPECT_THAT(paths(), ElementsAre("/", "/Serving Cell"));
}

TEST_F(KestrumPaneControllerTest, PaneOutsideAStackOpensNothing)
{
    const auto alone = pane(mixed());
    auto& screen = dynamic_cast<RecordingScreen&>(alone->screen());
    alone->viewWillAppear(false);
    screen.rows.tap(0);
    EXPECT_EQ(screen.title(), "Kestrum");
    EXPECT_EQ(stack, nullptr);
}

TEST_F(KestrumPaneControllerTest, NewNodeReplacesTitleAndRows)
{
    start(nullptr);
    stack->topViewController().reloadWithNode(inner("Field Test", {leaf("State", "Idle")}));
    EXPECT_EQ(top().title(), "Field Test");
    EXPECT_THAT(toolkit.navigation->path, ElementsAre("Field Test"));
    EXPECT_THAT(top().rows.texts(), ElementsAre("State: Idle"));

    stack->topViewController().reloadWithNode(inner("Field Test", {leaf("State", "Active")}));
    EXPECT_EQ(toolkit.navigation->titleChanges, 1) << "the title did not change";

    stack->topViewController().reloadWithNode(nullptr);
    EXPECT_EQ(top().title(), "Kestrum");
    EXPECT_THAT(top().rows.texts(), IsEmpty());
}

TEST_F(KestrumPaneControllerTest, PaneWhoseNodeBecameALeafShowsItsTitleAndNoRows)
{
    start(mixed());
    top().rows.tap(0);
    stack->topViewController().reloadWithNode(leaf("Serving Cell", "none"));
    EXPECT_EQ(top().title(), "Serving Cell");
    EXPECT_EQ(top().rows.rowCount(), 0u);
    EXPECT_THAT(top().rows.texts(), IsEmpty());
}

TEST_F(KestrumPaneControllerTest, ReloadKeepsEveryRowsKindInAMixedPane)
{
    start(mixed());
    const auto* first = &top().rows.reusable(0);
    const auto* second = &top().rows.reusable(1);
    stack->topViewController().reloadWithNode(
        inner("Kestrum", {inner("Serving Cell"), leaf("State", "Active"), inner("Neighbors")}));
    EXPECT_EQ(&top().rows.reusable(0), first);
    EXPECT_EQ(&top().rows.reusable(1), second);
    EXPECT_THAT(top().rows.texts(), ElementsAre("Serving Cell", "State: Active", "Neighbors"));
    EXPECT_EQ(top().rows.row(0).strip(), nullptr);
    EXPECT_NE(top().rows.row(1).strip(), nullptr);
    EXPECT_EQ(top().rows.cellsMade, 3);
}

TEST_F(KestrumPaneControllerTest, KeyOnlyCellReusedForALeafShowsTheNameWithoutAValue)
{
    start(inner("Kestrum", {inner("Serving Cell")}));
    stack->topViewController().reloadWithNode(inner("Kestrum", {leaf("State", "Idle")}));
    EXPECT_EQ(top().rows.row(0).key()->text(), "State");
    EXPECT_EQ(top().rows.row(0).value(), nullptr);
    EXPECT_EQ(top().rows.row(0).accessory, Accessory::None);
    EXPECT_EQ(top().rows.row(0).key()->frame(), (Rect{10, 13, 45, 18}));
    EXPECT_EQ(top().rows.cellsMade, 1);
}

TEST_F(KestrumPaneControllerTest, LeafCellReusedForAnInnerRowKeepsItsStripWithAnEmptyValue)
{
    start(inner("Kestrum", {leaf("State", "Idle")}));
    stack->topViewController().reloadWithNode(inner("Kestrum", {inner("Serving Cell")}));
    EXPECT_EQ(top().rows.row(0).key()->text(), "Serving Cell");
    ASSERT_NE(top().rows.row(0).value(), nullptr);
    EXPECT_EQ(top().rows.row(0).value()->text(), std::nullopt);
    EXPECT_EQ(top().rows.row(0).accessory, Accessory::DisclosureIndicator);
    EXPECT_EQ(top().rows.row(0).key()->frame(), (Rect{10, 13, 108, 18}));

    stack->topViewController().reloadWithNode(inner("Kestrum", {leaf("State", "Idle")}));
    EXPECT_THAT(top().rows.texts(), ElementsAre("State: Idle"));
}

TEST_F(KestrumPaneControllerTest, ScrollingUsesFewCells)
{
    std::vector<Node> rows;
    rows.reserve(200);
    for (int i = 0; i < 200; ++i)
        rows.push_back(leaf(std::to_string(i), "value"));
    toolkit.record.visibleRows = 10;
    start(inner("Kestrum", rows));
    for (std::size_t row = 0; row <= 190; ++row)
        top().rows.scrollTo(row);
    EXPECT_EQ(top().rows.rowCount(), 200u);
    EXPECT_EQ(top().rows.row(199).key()->text(), "199");
    EXPECT_LE(top().rows.cellsMade, 20);
}

TEST_F(KestrumPaneControllerTest, ToolbarHoldsExactlyThreeItemsWhereSaveIsNotOffered)
{
    start(nullptr);
    stack->topViewController().setStatus("Connecting", true);
    ASSERT_EQ(top().toolbar.size(), 3u);
    EXPECT_EQ(*top().toolbar[0], ToolbarItem(ActivityIndicatorItem{true}));
    EXPECT_EQ(*top().toolbar[1], ToolbarItem(LabelItem{"Connecting", Font{"", 14, false}}));
    EXPECT_EQ(*top().toolbar[2], ToolbarItem(FlexibleSpaceItem{}));
    EXPECT_EQ(top().toolbarAnimated, true);
    EXPECT_FALSE(toolkit.navigation->toolbarHidden);
}

TEST_F(KestrumPaneControllerTest, SaveIsTheLastItemAndAsksTheApplication)
{
    application.allowed = true;
    start(nullptr);
    ASSERT_EQ(top().toolbar.size(), 4u);
    EXPECT_EQ(top().saveButton(), top().toolbar[3]);
    top().pressSave();
    EXPECT_EQ(application.shown, 1);
}

TEST_F(KestrumPaneControllerTest, HeldSaveButtonIsNotLostToARefresh)
{
    application.allowed = true;
    start(mixed());
    const auto held = top().saveButton();
    const auto label = top().toolbar[1];
    stack->topViewController().reloadWithNode(mixed());
    stack->topViewController().setStatus("Updated 2026-11-16 at 06:05:44", false);
    EXPECT_EQ(top().saveButton(), held);
    EXPECT_NE(top().toolbar[1], label) << "another status is another item";
}

TEST_F(KestrumPaneControllerTest, NoStatusIsAnEmptyOne)
{
    start(nullptr);
    stack->topViewController().setStatus("Connecting", true);
    stack->topViewController().setStatus(std::nullopt, false);
    EXPECT_EQ(top().status(), "");
    EXPECT_FALSE(top().isLoading());
}

TEST_F(KestrumPaneControllerTest, LeavingPaneGivesUpTheKeyboard)
{
    start(mixed());
    auto& root = top();
    root.rows.tap(0);
    EXPECT_EQ(root.resigned, 1);
}

} // namespace
} // namespace kestrum
