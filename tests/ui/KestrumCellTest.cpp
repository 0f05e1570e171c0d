#include "ui/KestrumCell.h"

#include "doubles/RecordingToolkit.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

constexpr std::string_view kIdentifier = "KestrumPaneControllerCell";

class NoRows final : public TableDataSource {
public:
    std::size_t numberOfRowsInSection(TableView&, std::size_t) override { return 0; }
    std::shared_ptr<ReusableCell> cellForRowAtIndexPath(TableView&, IndexPath) override { return nullptr; }
    void didSelectRowAtIndexPath(TableView&, std::optional<IndexPath>) override {}
};

/// Each bold character of 15 points is 9 wide, each line 18 high; rows are 44 high.
class KestrumCellFrames : public testing::Test {
protected:
    std::shared_ptr<KestrumCell> keyCell()
    {
        return KestrumCell::initWithStyleKey(toolkit, table, CellStyle::KeyAndDetail, kIdentifier);
    }
    std::shared_ptr<KestrumCell> leafCell()
    {
        return KestrumCell::initWithStyle(toolkit, table, CellStyle::KeyAndDetail, kIdentifier);
    }
    /// A leaf's row of the given width after its layout. The numbers are the texts' lengths.
    const RecordingCell& leaf(double width, std::size_t key, std::size_t value)
    {
        toolkit.record.tableWidth = width;
        kept = leafCell();
        kept->setTexts(std::string(key, 'k'), std::string(value, 'v'));
        kept->setLayout();
        return drawn(*kept);
    }
    static RecordingCell& drawn(KestrumCell& cell) { return dynamic_cast<RecordingCell&>(cell.cell()); }

    RecordingToolkit toolkit;
    NoRows source;
    RecordingTable table{toolkit.record, source};
    std::shared_ptr<KestrumCell> kept;
};

TEST_F(KestrumCellFrames, KeyOnlyCellHoldsItsKeyWithoutStripOrValue)
{
    const auto cell = keyCell();
    EXPECT_EQ(cell->reuseIdentifier(), "KestrumPaneControllerCell");
    EXPECT_EQ(cell->value(), nullptr);
    EXPECT_EQ(drawn(*cell).style, CellStyle::KeyAndDetail);
    EXPECT_EQ(drawn(*cell).strip(), nullptr);
    ASSERT_EQ(drawn(*cell).subviews.size(), 1u);
    EXPECT_EQ(drawn(*cell).subviews[0], cell->key());
    EXPECT_EQ(cell->key()->font(), (Font{"", 15, true}));
}

TEST_F(KestrumCellFrames, LeafCellHoldsBothLabelsInItsStrip)
{
    const auto cell = leafCell();
    ASSERT_NE(drawn(*cell).strip(), nullptr);
    EXPECT_EQ(drawn(*cell).subviews.size(), 1u);
    EXPECT_EQ(drawn(*cell).strip()->subviews, (std::vector<std::shared_ptr<View>>{cell->key(), cell->value()}));
    EXPECT_EQ(cell->key()->font(), (Font{"", 15, true}));
    EXPECT_EQ(cell->value()->font(), (Font{"", 15, false}));
}

TEST_F(KestrumCellFrames, KeyStandsTenPointsInAndCentred)
{
    const auto cell = keyCell();
    drawn(*cell).setAccessory(Accessory::DisclosureIndicator);
    cell->setTexts("Serving", std::nullopt);
    cell->setLayoutKey();
    EXPECT_EQ(cell->key()->frame(), (Rect{10, 13, 63, 18}));
}

TEST_F(KestrumCellFrames, ValueThatFitsIsRightAligned)
{
    const auto& cell = leaf(320, 4, 7);
    EXPECT_EQ(cell.key()->frame(), (Rect{10, 13, 36, 18}));
    EXPECT_EQ(cell.value()->frame(), (Rect{257, 13, 63, 18}));
    EXPECT_EQ(cell.strip()->frame(), (Rect{0, 0, 320, 50}));
    EXPECT_EQ(cell.strip()->contentSize, (Size{320, 50}));
}

TEST_F(KestrumCellFrames, ExactFitPutsTheValueBehindTheKeyAndDoesNotScroll)
{
    // 90 + 10 + 50 + 180 = 330
    const auto& cell = leaf(330, 10, 20);
    EXPECT_EQ(cell.value()->frame(), (Rect{150, 13, 180, 18}));
    EXPECT_EQ(cell.strip()->contentSize, (Size{330, 50}));
}

TEST_F(KestrumCellFrames, OnePointMoreThanNeededRightAligns)
{
    const auto& cell = leaf(331, 10, 20);
    EXPECT_EQ(cell.value()->frame(), (Rect{151, 13, 180, 18}));
    EXPECT_EQ(cell.strip()->contentSize, (Size{331, 50}));
}

TEST_F(KestrumCellFrames, OnePointLessThanNeededScrolls)
{
    const auto& cell = leaf(329, 10, 20);
    EXPECT_EQ(cell.value()->frame(), (Rect{150, 13, 180, 18}));
    EXPECT_EQ(cell.strip()->contentSize, (Size{599, 50}));
    EXPECT_EQ(cell.strip()->frame(), (Rect{0, 0, 329, 50}));
}

TEST_F(KestrumCellFrames, LongValueWidensTheStripByKeyAndValue)
{
    const auto& cell = leaf(320, 4, 60);
    EXPECT_EQ(cell.value()->frame(), (Rect{96, 13, 540, 18}));
    EXPECT_EQ(cell.strip()->contentSize, (Size{320 + 36 + 540, 50}));
}

TEST_F(KestrumCellFrames, EmptyValueStandsAtTheEdgeWithoutWidth)
{
    EXPECT_EQ(leaf(320, 4, 0).value()->frame(), (Rect{320, 13, 0, 18}));
}

TEST_F(KestrumCellFrames, LayoutFollowsTheContentAreaOfTheMoment)
{
    auto& cell = const_cast<RecordingCell&>(leaf(320, 4, 7));
    cell.rowWidth = 500;
    kept->setLayout();
    EXPECT_EQ(cell.value()->frame(), (Rect{437, 13, 63, 18}));
    EXPECT_EQ(cell.strip()->frame(), (Rect{0, 0, 500, 50}));
}

TEST_F(KestrumCellFrames, KeyOnlyCellUsedForALeafShowsTheNameAlone)
{
    const auto cell = keyCell();
    cell->setTexts("RSSI", "-80 dBm");
    cell->setLayout();
    EXPECT_EQ(cell->key()->text(), "RSSI");
    EXPECT_EQ(cell->key()->frame(), (Rect{10, 13, 36, 18}));
    EXPECT_EQ(drawn(*cell).subviews.size(), 1u);
}

TEST_F(KestrumCellFrames, LeafCellUsedForAnInnerRowKeepsItsStripWithAnEmptyValue)
{
    const auto& cell = leaf(320, 4, 60);
    kept->setTexts("Serving", std::nullopt);
    kept->setLayoutKey();
    EXPECT_EQ(cell.value()->text(), std::nullopt);
    EXPECT_EQ(cell.key()->frame(), (Rect{10, 13, 63, 18}));
    EXPECT_EQ(cell.strip()->contentSize, (Size{896, 50}));
}

TEST_F(KestrumCellFrames, LabelsCanBeReplaced)
{
    const auto cell = leafCell();
    const auto key = toolkit.makeLabel(), value = toolkit.makeLabel();
    cell->setKey(key);
    cell->setValue(value);
    cell->setTexts("a", "b");
    EXPECT_EQ(key->text(), "a");
    EXPECT_EQ(value->text(), "b");
}

} // namespace
} // namespace kestrum
