// Plots as characters, and a sheet's answers to keys and to new contents, without a screen.
#include "frontends/terminal/Plot.h"
#include "frontends/terminal/SheetScreen.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <cmath>
#include <limits>
#include <string>
#include <vector>

namespace kestrum::terminal {
namespace {

using testing::AllOf, testing::Each, testing::ElementsAre, testing::HasSubstr, testing::IsEmpty, testing::SizeIs;
using Point = SheetPlot::Point;
using Texts = std::vector<std::string>;

constexpr double kNaN = std::numeric_limits<double>::quiet_NaN(), kInfinity = std::numeric_limits<double>::infinity();

/// Points of one number each, at equal distances from 0 to 1.
std::vector<Point> points(const std::vector<double>& values)
{
    std::vector<Point> points;
    for (std::size_t i = 0; i < values.size(); ++i) {
        const double at = values.size() > 1 ? static_cast<double>(i) / static_cast<double>(values.size() - 1) : 0;
        points.push_back({at, values[i], values[i], values[i]});
    }
    return points;
}

SheetPlot plotOf(const std::vector<double>& values, double bottom = 0, double top = 1)
{
    SheetPlot plot;
    plot.points = points(values);
    plot.bottom = bottom;
    plot.top = top;
    return plot;
}

Texts drawn(const SheetPlot& plot, PlotMarks marks, int columns, int rows)
{
    Texts lines;
    for (const auto& each : curve(plot, marks, columns, rows))
        lines.push_back(utf8(each));
    return lines;
}

/// The pieces as the line of a screen, later ones over earlier ones, without blanks at the end.
std::string line(const Pieces& pieces)
{
    std::wstring cells;
    for (const auto& [column, text, style] : pieces) {
        auto at = static_cast<std::size_t>(std::max(column, 0));
        Glyphs glyphs(text);
        while (const auto glyph = glyphs.next()) {
            cells.resize(std::max(cells.size(), at + 1), L' ');
            cells[at++] = glyph->text[0];
        }
    }
    cells.erase(cells.find_last_not_of(L' ') + 1);
    return utf8(cells);
}

Texts linesOf(const PlotPicture& picture)
{
    Texts lines;
    for (const auto& each : picture.lines)
        lines.push_back(line(each));
    return lines;
}

class TerminalPlot : public testing::Test {
protected:
    static void SetUpTestSuite() { chooseLocale(); }
};

// Curves

TEST_F(TerminalPlot, DrawsARisingLine)
{
    const auto plot = plotOf({0, 1});
    EXPECT_THAT(drawn(plot, PlotMarks::Braille, 8, 2), ElementsAre("    ⣀⠤⠒⠉", "⣀⠤⠒⠉    "));
    EXPECT_THAT(drawn(plot, PlotMarks::Blocks, 8, 2), ElementsAre("    ▂▄▆█", "▁▃▅▇    "));
    EXPECT_THAT(drawn(plot, PlotMarks::Ascii, 6, 2), ElementsAre("   _-'", "_-'   "));
}

TEST_F(TerminalPlot, JoinsAStepWithItsNeighbourInBraille)
{
    EXPECT_THAT(drawn(plotOf({0, 0, 1, 1}), PlotMarks::Braille, 2, 2), ElementsAre(" ⡏", "⣀⠇"));
}

TEST_F(TerminalPlot, LeavesAGapEmpty)
{
    auto plot = plotOf({0.5, 0.5, kNaN, 0.5, 0.5});
    EXPECT_THAT(drawn(plot, PlotMarks::Braille, 5, 1), ElementsAre("⠒⠂ ⠐⠒"));
    EXPECT_THAT(drawn(plot, PlotMarks::Blocks, 5, 1), ElementsAre("▅▅ ▅▅"));
    EXPECT_THAT(drawn(plot, PlotMarks::Ascii, 5, 1), ElementsAre("-- --"));
    plot.points[2] = {0.5, 0, kNaN, 1};
    EXPECT_THAT(drawn(plot, PlotMarks::Ascii, 5, 1), ElementsAre("-- --"));
}

TEST_F(TerminalPlot, ShowsASinglePoint)
{
    SheetPlot plot;
    plot.points = {{0.5, 0, 0, 0}};
    EXPECT_THAT(drawn(plot, PlotMarks::Braille, 3, 2), ElementsAre("   ", " ⢀ "));
    EXPECT_THAT(drawn(plot, PlotMarks::Blocks, 3, 2), ElementsAre("   ", " ▁ ")) << "the least is not nothing";
    EXPECT_THAT(drawn(plot, PlotMarks::Ascii, 3, 2), ElementsAre("   ", " _ "));
}

TEST_F(TerminalPlot, PutsPointsBeyondTheEndsAtTheEnds)
{
    const auto plot = plotOf({-999, kInfinity, 999}, -140, -44);
    EXPECT_THAT(drawn(plot, PlotMarks::Blocks, 3, 2), ElementsAre("  █", "▁  "));
    SheetPlot beyond;
    beyond.points = {{-3, 1, 1, 1}, {9, 1, 1, 1}};
    EXPECT_THAT(drawn(beyond, PlotMarks::Ascii, 4, 1), ElementsAre("''''"));
}

TEST_F(TerminalPlot, DrawsSeveralPointsOfOneColumnAsAStroke)
{
    SheetPlot plot;
    plot.points = {{0, 0.1, 0.3, 0.9}, {0.4, 0.6, 0.6, 0.6}, {0.5, 0.2, 0.5, 0.5}};
    EXPECT_THAT(drawn(plot, PlotMarks::Blocks, 2, 2), ElementsAre("▇▁", "██"));
    EXPECT_THAT(drawn(plot, PlotMarks::Ascii, 2, 2), ElementsAre("||", "||"));
    EXPECT_THAT(drawn(plot, PlotMarks::Ascii, 1, 4), ElementsAre("|", "|", "|", "|"));
}

TEST_F(TerminalPlot, DrawsOneSampleInEachColumnOfDots)
{
    std::vector<double> values;
    for (int i = 0; i < 156; ++i)
        values.push_back(i % 2);
    const auto lines = drawn(plotOf(values), PlotMarks::Braille, 78, 1);
    ASSERT_THAT(lines, SizeIs(1));
    EXPECT_EQ(columns(lines[0]), 78);
    EXPECT_EQ(lines[0].find(' '), std::string::npos);
}

TEST_F(TerminalPlot, DrawsADayInOneLine)
{
    SheetPlot plot;
    for (int i = 0; i < 1440; ++i) {
        const double value = i == 700 ? -60 : -100;
        plot.points.push_back({i / 1439.0, i == 200 ? -140 : value, value, value});
    }
    plot.bottom = -140;
    plot.top = -44;
    const auto lines = drawn(plot, PlotMarks::Ascii, 78, 3);
    EXPECT_EQ(lines[0], std::string(37, ' ') + "|" + std::string(40, ' ')) << "one minute is not lost";
    EXPECT_EQ(lines[1], std::string(10, '_') + "|" + std::string(26, '_') + "|" + std::string(40, '_'));
    EXPECT_EQ(lines[2], std::string(10, ' ') + "|" + std::string(67, ' '));
}

TEST_F(TerminalPlot, SurvivesAnyInput)
{
    const std::vector<double> odd = {kNaN, kInfinity, -kInfinity, -1e300, -1, 0, 0.5, 1, 2, 1e300};
    SheetPlot plot;
    for (const double each : odd)
        for (const double other : odd)
            plot.points.push_back({each, other, each, other});
    plot.points.push_back({0.9, 0, 0, 0});
    plot.points.push_back({0.1, 1, 1, 1}); // a decreasing place
    plot.numbers = plot.times = plot.ranges = {"", "a text that is far longer than a small screen is wide", "漢字"};
    plot.range = 99;
    plot.cursor = 9999;
    plot.sentence = plot.reading = std::string(500, 'x');
    for (const double each : odd) {
        plot.bands.push_back({each, "good"});
        plot.marks.push_back({each, "漢字"});
    }
    auto spans = plot;
    spans.points.clear();
    for (const double each : odd)
        for (const double other : odd)
            spans.spans.push_back({each, other, "idle"});
    const SheetPlot empty;
    for (const auto& [bottom, top] :
         {std::pair{0.0, 1.0}, {1.0, 1.0}, {1.0, 0.0}, {kNaN, kNaN}, {-kInfinity, kInfinity}})
        for (const auto& each : {plot, spans, empty})
            for (const auto marks : {PlotMarks::Braille, PlotMarks::Blocks, PlotMarks::Ascii})
                for (const int width : {-1, 0, 1, 2, 3, 10, 40, 200}) {
                    auto shown = each;
                    shown.bottom = bottom;
                    shown.top = top;
                    const auto picture = draw(shown, marks, width, std::min(width, 20));
                    EXPECT_FALSE(width > 3 && picture.lines.empty());
                    for (const auto& line : curve(shown, marks, width, 3))
                        EXPECT_EQ(line.size(), static_cast<std::size_t>(width));
                    for (const bool isAfter : {false, true})
                        pointBeside(shown, isAfter, width);
                    pointAt(shown, width / 2, width);
                }
}

TEST_F(TerminalPlot, TakesBrailleWhereTheTerminalHasIt)
{
    const auto choose = [](Charset charset, std::string_view terminal, std::string_view asked = "") {
        return choosePlotMarks(charset, terminal, asked);
    };
    EXPECT_EQ(choose(Charset::Unicode, "xterm-256color"), PlotMarks::Braille);
    EXPECT_EQ(choose(Charset::Unicode, ""), PlotMarks::Braille);
    EXPECT_EQ(choose(Charset::Unicode, "linux"), PlotMarks::Blocks);
    EXPECT_EQ(choose(Charset::Unicode, "linux-16color"), PlotMarks::Blocks);
    EXPECT_EQ(choose(Charset::Ascii, "xterm"), PlotMarks::Ascii);
    EXPECT_EQ(choose(Charset::Unicode, "linux", "braille"), PlotMarks::Braille);
    EXPECT_EQ(choose(Charset::Unicode, "xterm", "blocks"), PlotMarks::Blocks);
    EXPECT_EQ(choose(Charset::Unicode, "xterm", "ascii"), PlotMarks::Ascii);
    EXPECT_EQ(choose(Charset::Ascii, "xterm", "braille"), PlotMarks::Ascii) << "it cannot show others";
    EXPECT_EQ(choose(Charset::Unicode, "linux", "pixels"), PlotMarks::Blocks);
}

// Strips

SheetPlot stripOf(std::vector<SheetPlot::Span> spans)
{
    SheetPlot plot;
    plot.spans = std::move(spans);
    return plot;
}

TEST_F(TerminalPlot, ShowsStatesAsAStrip)
{
    EXPECT_EQ(line(strip(stripOf({{0, 0.5, "idle"}, {0.5, 1, "connected"}}), 20)), "│idle─────│connected");
    EXPECT_EQ(line(strip(stripOf({{0, 0.25, "connected"}, {0.25, 1, "idle"}}), 20)), "│con…│idle──────────");
    EXPECT_EQ(line(strip(stripOf({{0, 0.15, "118"}, {0.15, 0.3, "7"}, {0.3, 1, "idle"}}), 20)), "│──│7─│idle─────────");
    EXPECT_EQ(line(strip(stripOf({{0, 0.25, "a"}, {0.5, 0.75, "b"}}), 20)), "│a───     │b───") << "a gap";
}

TEST_F(TerminalPlot, ShowsAShortStateToo)
{
    EXPECT_EQ(line(strip(stripOf({{0, 0.5, "idle"}, {0.5, 0.501, "busy"}, {0.501, 1, "idle"}}), 12)), "│idle─││idle");
    EXPECT_EQ(line(strip(stripOf({{0, 0.999, "idle"}, {0.999, 1, "busy"}}), 10)), "│idle────│");
}

TEST_F(TerminalPlot, MarksTheStateAtTheCursor)
{
    auto plot = stripOf({{0, 0.5, "idle"}, {0.5, 1, "busy"}});
    plot.cursor = 1;
    const auto pieces = strip(plot, 10);
    ASSERT_THAT(pieces, SizeIs(2));
    EXPECT_FALSE(pieces[0].style.reverse);
    EXPECT_TRUE(pieces[1].style.reverse);
}

TEST_F(TerminalPlot, MarksTheCursorInAColumnOfSeveralStates)
{
    auto plot = stripOf({{0, 0.5, "a"}, {0.5, 0.51, "b"}, {0.51, 0.52, "c"}, {0.52, 1, "d"}});
    plot.cursor = 2;
    const auto pieces = strip(plot, 10);
    ASSERT_EQ(line(pieces), "│a───││d──");
    EXPECT_FALSE(pieces[0].style.reverse);
    EXPECT_TRUE(pieces[1].style.reverse);
}

// The whole plot

SheetPlot fullPlot()
{
    auto plot = plotOf({-140, -44}, -140, -44);
    plot.bands = {{-200, "no service"}, {-110, "poor"}, {-90, "good"}};
    plot.numbers = {"-140 dBm", "-92 dBm", "-44 dBm"};
    plot.times = {"14:00", "14:07", "14:15"};
    plot.ranges = {"15 min", "1 h", "1 day"};
    plot.range = 1;
    plot.reading = "14:15:00  -44 dBm";
    plot.marks = {{0, "77"}, {0.5, "101"}, {0.9, ""}};
    plot.sentence = "RSRP, -44 dBm now, rising";
    return plot;
}

TEST_F(TerminalPlot, HasItsTextsAroundIt)
{
    EXPECT_THAT(linesOf(draw(fullPlot(), PlotMarks::Ascii, 50, 5)),
                ElementsAre(" 15 min  1 h  1 day             14:15:00  -44 dBm", //
                            "  -44 dBm │                     __--''",            //
                            "          │                __--'",                  //
                            "  -92 dBm │·   ·   ·  __-''·   ·   ·   good",       //
                            "          │·   · _--'' ·   ·   ·   ·   poor",       //
                            " -140 dBm │__--''                      no service", //
                            "           ↑77          ↑101       ↑",              //
                            "           14:00      14:07      14:15",            //
                            " RSRP, -44 dBm now, rising"));
}

TEST_F(TerminalPlot, ShowsTheChosenTimeWithoutColour)
{
    const auto picture = draw(fullPlot(), PlotMarks::Ascii, 50, 5);
    const auto& top = picture.lines[0];
    ASSERT_GE(top.size(), 3u);
    EXPECT_FALSE(top[0].style.reverse);
    EXPECT_TRUE(top[1].style.reverse);
    EXPECT_FALSE(top[2].style.reverse);
    EXPECT_THAT(picture.ranges, ElementsAre(1, 9, 14));
}

TEST_F(TerminalPlot, DrawsItsCursorThroughAllRows)
{
    auto plot = plotOf({0, 0.5, 1});
    plot.cursor = 1;
    const auto picture = draw(plot, PlotMarks::Ascii, 14, 3);
    EXPECT_THAT(linesOf(picture), ElementsAre(" │     │ _-''", " │    _-'", " │__-' │"));
}

TEST_F(TerminalPlot, MakesRoomForTheCurveOnANarrowScreen)
{
    auto plot = fullPlot();
    plot.sentence.clear();
    EXPECT_THAT(linesOf(draw(plot, PlotMarks::Ascii, 24, 3)),
                AllOf(testing::Contains(testing::StartsWith("  -44 dBm │")), Each(testing::Not(HasSubstr("good")))));
    const auto narrow = linesOf(draw(plot, PlotMarks::Ascii, 12, 3));
    EXPECT_THAT(narrow, Each(testing::Not(HasSubstr("dBm │"))));
    EXPECT_THAT(narrow, testing::Contains(" │      _-'"));
}

TEST_F(TerminalPlot, OmitsAWordThatHasNoRoomInItsBand)
{
    SheetPlot plot;
    plot.bands = {{0, "none"}, {0.3, "poor"}, {0.4, "fair"}, {0.5, "good"}, {0.6, "excellent"}};
    EXPECT_THAT(linesOf(draw(plot, PlotMarks::Ascii, 30, 3)),
                ElementsAre(" │                  excellent", " │·   ·   ·   ·   · poor", " │·   ·   ·   ·   · none"));
}

TEST_F(TerminalPlot, NamesTheLineThatAScreenReaderReads)
{
    auto plot = fullPlot();
    EXPECT_EQ(draw(plot, PlotMarks::Braille, 80, 5).reading, 8) << "the sentence";
    plot.cursor = 0;
    EXPECT_EQ(draw(plot, PlotMarks::Braille, 80, 5).reading, 0) << "the value at the cursor";
    EXPECT_EQ(draw(SheetPlot(), PlotMarks::Braille, 80, 5).reading, -1);
}

TEST_F(TerminalPlot, FindsThePointUnderAColumn)
{
    const auto plot = plotOf({0, 0, 0, 0, 0}); // in columns 0, 5, 10, 15, 19 of 20
    EXPECT_EQ(pointAt(plot, 0, 20), 0u);
    EXPECT_EQ(pointAt(plot, 6, 20), 1u);
    EXPECT_EQ(pointAt(plot, 9, 20), 2u);
    EXPECT_EQ(pointAt(plot, 19, 20), 4u);
    EXPECT_EQ(pointAt(SheetPlot(), 3, 20), std::nullopt);
    const auto states = stripOf({{0, 0.5, "idle"}, {0.5, 1, "busy"}});
    EXPECT_EQ(pointAt(states, 9, 20), 0u);
    EXPECT_EQ(pointAt(states, 10, 20), 1u);
    EXPECT_EQ(pointAt(states, 19, 20), 1u);
}

TEST_F(TerminalPlot, MovesItsCursorByColumnsOrByPoints)
{
    auto plot = plotOf(std::vector<double>(21, 0)); // two in each of 10 columns, three in the last one
    EXPECT_EQ(pointBeside(plot, false, 10), 17u) << "from the newest";
    EXPECT_EQ(pointBeside(plot, false, 0), 19u);
    EXPECT_EQ(pointBeside(plot, true, 10), std::nullopt);
    plot.cursor = 5;
    EXPECT_EQ(pointBeside(plot, true, 10), 6u);
    EXPECT_EQ(pointBeside(plot, false, 10), 3u);
    EXPECT_EQ(pointBeside(plot, true, 0), 6u);
    EXPECT_EQ(pointBeside(plot, false, 0), 4u);
    plot.cursor = 0;
    EXPECT_EQ(pointBeside(plot, false, 10), 0u);
    plot.cursor = 19;
    EXPECT_EQ(pointBeside(plot, true, 10), std::nullopt) << "the newest stands in the same column";
}

// The sheet's keys

struct NoRepaint final : Repaint {
    void repaintLater() override {}
};

class PlotKeys : public TerminalPlot, protected SheetOwner {
protected:
    PlotKeys()
    {
        auto plot = plotOf({0, 0, 0});
        plot.ranges = {"15 min", "1 h", "1 day"};
        show(plot);
    }
    void show(const SheetPlot& plot)
    {
        SheetContents contents;
        contents.parts = {{.plot = plot}};
        sheet.setContents(contents);
    }
    void press(std::vector<Input> keys)
    {
        for (const auto& each : keys)
            sheet.handle(each);
    }
    static Input letter(wchar_t c) { return {Key::Character, c}; }

    void sheetLeft() override { ++left; }
    void columnChosen(std::size_t) override {}
    void cursorMoved(std::optional<std::size_t> to) override { cursor.push_back(to); }
    void rangeChosen(std::size_t range) override { ranges.push_back(range); }

    NoRepaint repaint;
    TerminalSheet* place = nullptr;
    TerminalSheet sheet{*this, repaint, place, L't'};
    std::vector<std::optional<std::size_t>> cursor;
    std::vector<std::size_t> ranges;
    int left = 0;
};

TEST_F(PlotKeys, MoveTheCursor)
{
    press({{Key::Home}, {Key::End}, {Key::Left}, {Key::Right}, {Key::ShiftLeft}, letter(L'<'), letter(L'>')});
    EXPECT_THAT(cursor, ElementsAre(0u, std::nullopt, 1u, std::nullopt, 1u, 1u, std::nullopt));
    EXPECT_THAT(ranges, IsEmpty());
}

TEST_F(PlotKeys, ChooseTheTime)
{
    press({{Key::Tab}, {Key::BackTab}, letter(L'1'), letter(L'3'), letter(L'4'), letter(L'0')});
    EXPECT_THAT(ranges, ElementsAre(1u, 2u, 0u, 2u));
    EXPECT_THAT(cursor, IsEmpty());
}

TEST_F(PlotKeys, CloseTheSheet)
{
    press({letter(L'x'), letter(L'v'), letter(L't'), {Key::Escape}});
    EXPECT_EQ(left, 2);
}

TEST_F(PlotKeys, DoNothingInAnEmptyPlot)
{
    show({});
    press({{Key::Home}, {Key::Left}, {Key::Tab}, letter(L'1')});
    EXPECT_THAT(cursor, Each(std::nullopt));
    EXPECT_THAT(ranges, IsEmpty());
}

} // namespace
} // namespace kestrum::terminal
