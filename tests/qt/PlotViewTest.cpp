#include "frontends/qt/PlotView.h"
#include "QtTest.h"
#include "frontends/qt/Colours.h"
#include "frontends/qt/PlotShape.h"

#include <QScroller>

#include <cmath>
#include <limits>

namespace kestrum {
namespace {

using namespace qt;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr double kGap = std::numeric_limits<double>::quiet_NaN();

SheetPlot::Point pointAt(double at, double value)
{
    return {at, value, value, value};
}

/// Eleven points from -140 to -90 with a gap in the middle.
SheetPlot aPlot()
{
    SheetPlot plot;
    for (int i = 0; i <= 10; ++i)
        plot.points.push_back(pointAt(i / 10.0, i == 5 ? kGap : -140 + 5 * i));
    plot.bottom = -140;
    plot.top = -40;
    plot.bands = {{-140, "poor"}, {-90, "good"}};
    plot.numbers = {"-140 dBm", "-90", "-40"};
    plot.times = {"14:00", "14:07", "14:15"};
    plot.ranges = {"15 min", "1 h", "1 day"};
    plot.reading = "14:15:00  -90 dBm";
    plot.sentence = "Measured RSRP, -90 dBm now";
    return plot;
}

SheetPlot aStrip()
{
    SheetPlot plot;
    plot.spans = {{0, 0.25, "Idle"}, {0.25, 0.75, "Connected"}, {0.75, 1, "Idle"}};
    return plot;
}

constexpr QRectF kPlace{0, 0, 100, 100};

TEST(PlotShape, DrawsNoLineThroughAGap)
{
    const SheetPlot plot = aPlot();
    const auto lines = PlotShape(plot, kPlace).lines();
    ASSERT_EQ(lines.size(), 2u);
    EXPECT_EQ(lines[0].size(), 5);
    EXPECT_EQ(lines[0].front(), QPointF(0, 100));
    EXPECT_EQ(lines[1].front().x(), 60);
    EXPECT_EQ(lines[1].back(), QPointF(100, 50));
}

TEST(PlotShape, HasALineForAPointBetweenGaps)
{
    SheetPlot plot = aPlot();
    plot.points = {pointAt(0, kGap), pointAt(0.5, -40), pointAt(1, kGap)};
    const auto lines = PlotShape(plot, kPlace).lines();
    ASSERT_EQ(lines.size(), 1u);
    EXPECT_EQ(lines[0], QPolygonF({QPointF(50, 0)}));
    plot.points = {pointAt(0, kGap)};
    EXPECT_THAT(PlotShape(plot, kPlace).lines(), IsEmpty());
}

TEST(PlotShape, SpreadsFromTheLeastToTheGreatestNumber)
{
    SheetPlot plot = aPlot();
    EXPECT_THAT(PlotShape(plot, kPlace).spreads(), IsEmpty());
    plot.points[1] = {0.1, -140, -120, -100};
    const auto spreads = PlotShape(plot, kPlace).spreads();
    ASSERT_EQ(spreads.size(), 1u) << "the other line has equal numbers";
    EXPECT_EQ(spreads[0].boundingRect(), QRectF(QPointF(0, 60), QPointF(40, 100)));
}

TEST(PlotShape, KeepsNumbersBeyondTheAxisAtItsEnds)
{
    const SheetPlot plot = aPlot();
    EXPECT_EQ(PlotShape(plot, kPlace).y(-200), 100);
    EXPECT_EQ(PlotShape(plot, kPlace).y(0), 0);
    EXPECT_EQ(PlotShape(plot, kPlace).band(0), QRectF(0, 50, 100, 50));
    EXPECT_EQ(PlotShape(plot, kPlace).band(1), QRectF(0, 0, 100, 50));
}

TEST(PlotShape, FindsThePointOrTheSpanUnderAFinger)
{
    const SheetPlot plot = aPlot(), strip = aStrip();
    EXPECT_EQ(PlotShape(plot, kPlace).nearest(-20), 0u);
    EXPECT_EQ(PlotShape(plot, kPlace).nearest(34), 3u);
    EXPECT_EQ(PlotShape(plot, kPlace).nearest(36), 4u);
    EXPECT_EQ(PlotShape(plot, kPlace).nearest(500), 10u);
    EXPECT_EQ(PlotShape(strip, kPlace).nearest(70), 1u);
    EXPECT_EQ(PlotShape(SheetPlot{}, kPlace).nearest(70), std::nullopt);
}

/// A sheet with a plot, whose owner does as it is asked.
class APlotView : public InAWindow, public SheetOwner {
protected:
    void sheetLeft() override { sheet.reset(); }
    void columnChosen(std::size_t) override {}
    void cursorMoved(std::optional<std::size_t> to) override
    {
        cursors.push_back(to);
        plot.cursor = to;
        plot.reading = to ? std::to_string(*to) : "now";
        refresh();
    }
    void rangeChosen(std::size_t range) override
    {
        plot.range = range;
        refresh();
    }

    void open(const SheetPlot& shown)
    {
        plot = shown;
        pane = screenOf(rows);
        navigation().show(*pane, {"Kestrum"}, Transition::None, false);
        makeVisible();
        sheet = navigation().openSheet(*this);
        refresh();
        QCoreApplication::processEvents(); // Qt lays it out
    }
    void refresh()
    {
        SheetPart part;
        part.plot = plot;
        sheet->setContents({.title = "Trend", .parts = {part}});
    }
    void key(Qt::Key key) { QTest::keyClick(navigation().insight(), key); }
    PlotView& view() { return *navigation().insight()->plot(); }
    Plot& drawing() { return view().drawing(); }
    QPoint placeOf(std::size_t entry)
    {
        const PlotShape shape(drawing().plot(), drawing().place());
        return QPointF(shape.xOf(entry), drawing().place().center().y()).toPoint();
    }

    Rows rows = Rows::leaves(3);
    std::unique_ptr<TableScreen> pane;
    std::unique_ptr<Sheet> sheet;
    SheetPlot plot;
    std::vector<std::optional<std::size_t>> cursors;
};

TEST_F(APlotView, MovesItsCursorUnderAFinger)
{
    open(aPlot());
    press(drawing(), placeOf(3));
    EXPECT_EQ(plot.cursor, 3u);
    EXPECT_EQ(view().reading().text(), QStringLiteral("3"));
    QTest::mouseMove(window().windowHandle(), drawing().mapTo(&window(), placeOf(6)));
    EXPECT_EQ(plot.cursor, 6u);
    release(drawing(), placeOf(6));
    cursors.clear();
    QTest::mouseMove(window().windowHandle(), drawing().mapTo(&window(), placeOf(8)));
    EXPECT_THAT(cursors, IsEmpty()) << "no finger is down";
}

TEST_F(APlotView, KeepsItsCursorWhileAFingerScrolls)
{
    open(aPlot());
    pressAndMove(drawing(), placeOf(3), placeOf(3) + QPoint(40, 140));
    EXPECT_EQ(plot.cursor, 3u);
}

TEST_F(APlotView, MovesItsCursorByKeys)
{
    open(aPlot());
    for (const auto each : {Qt::Key_Left, Qt::Key_Left, Qt::Key_Right, Qt::Key_Home, Qt::Key_Left, Qt::Key_End,
                            Qt::Key_Right, Qt::Key_Escape})
        key(each);
    EXPECT_THAT(cursors, ElementsAre(9u, 8u, 9u, 0u, 0u, 10u, 10u, std::nullopt));
    key(Qt::Key_Escape);
    EXPECT_EQ(navigation().insight(), nullptr);
}

TEST_F(APlotView, MovesItsCursorFromStateToState)
{
    open(aStrip());
    click(drawing(), placeOf(1));
    key(Qt::Key_Left);
    EXPECT_THAT(cursors, ElementsAre(1u, 0u));
}

TEST_F(APlotView, HasAButtonAndAKeyForEachRange)
{
    open(aPlot());
    ASSERT_EQ(view().ranges().size(), 3u);
    for (const Button* each : view().ranges()) {
        EXPECT_GE(each->height(), 44);
        EXPECT_GE(each->width(), 44);
    }
    EXPECT_TRUE(view().ranges()[0]->isChecked());
    click(*view().ranges()[2]);
    EXPECT_EQ(plot.range, 2u);
    EXPECT_TRUE(view().ranges()[2]->isChecked());
    EXPECT_FALSE(view().ranges()[0]->isChecked());
    key(Qt::Key_2);
    EXPECT_EQ(plot.range, 1u);
    key(Qt::Key_4);
    EXPECT_EQ(plot.range, 1u);
    key(Qt::Key_Left);
    EXPECT_EQ(plot.cursor, 9u) << "the arrow keys stay the cursor's";
}

TEST_F(APlotView, StandsStillWhileItIsRefreshed)
{
    open(aPlot());
    click(drawing(), placeOf(3));
    const QRect before = drawing().geometry();
    plot.reading = std::string(200, 'a') + ' ' + std::string(200, 'b');
    plot.points.back() = pointAt(1, -60);
    refresh();
    QCoreApplication::processEvents();
    EXPECT_EQ(drawing().geometry(), before);
    EXPECT_EQ(drawing().plot().cursor, 3u);
}

TEST_F(APlotView, IsASentenceToAScreenReader)
{
    open(aPlot());
    auto* spoken = QAccessible::queryAccessibleInterface(&drawing());
    EXPECT_EQ(spoken->text(QAccessible::Name), QStringLiteral("Measured RSRP, -90 dBm now"));
    EXPECT_EQ(spoken->role(), QAccessible::Chart);
}

TEST_F(APlotView, DrawsTheCurveAndLeavesTheGapEmpty)
{
    SheetPlot level = aPlot();
    level.bands.clear();
    for (auto& point : level.points)
        if (!std::isnan(point.mean))
            point = pointAt(point.at, -60);
    open(level);
    const QImage image = drawing().grab().toImage();
    // Only the curve is darker than a hairline there.
    const auto curve = [&](double at) {
        const QRectF place = drawing().place();
        int count = 0;
        for (int y = 0; y < static_cast<int>(place.bottom()); ++y)
            count += image.pixelColor(static_cast<int>(place.left() + at * place.width()), y).red() <
                     coloursOf(drawing()).line.red();
        return count;
    };
    EXPECT_GT(curve(0.25), 0);
    EXPECT_EQ(curve(0.5), 0);
    EXPECT_EQ(curve(0.45), 0);
    EXPECT_GT(curve(0.75), 0);
}

TEST_F(APlotView, NamesAnIdentityOnlyWhereThereIsRoom)
{
    SheetPlot identity;
    identity.marks = {{0.5, "112"}, {0.505, ""}};
    open(identity);
    const auto nameAtTheMiddle = [&] {
        const QRectF place = drawing().place();
        const QRect right(static_cast<int>(place.center().x()) + 4, static_cast<int>(place.bottom()) - 16, 20, 14);
        return drawing().grab(right).toImage();
    };
    const QImage named = nameAtTheMiddle();
    plot.marks = {{0.5, ""}, {0.505, ""}};
    refresh();
    const QImage unnamed = nameAtTheMiddle();
    EXPECT_NE(named, unnamed);
    plot.marks = {{0.5, "112"}, {0.505, std::string(100, 'm')}};
    refresh();
    EXPECT_EQ(nameAtTheMiddle(), unnamed);
}

TEST_F(APlotView, FitsASmallScreen)
{
    open(aPlot());
    window().resize(360, 640);
    QCoreApplication::processEvents();
    EXPECT_LE(drawing().mapTo(&window(), drawing().rect().bottomRight()).x(), 360);
    EXPECT_LE(view().ranges()[2]->mapTo(&window(), QPoint(44, 44)).y(), 640);
    EXPECT_GE(drawing().place().width(), 200);
}

} // namespace
} // namespace kestrum
