#include "insight/TrendSheet.h"

#include "LogGenerator/Quantities.h"
#include "insight/FilledHistory.h"
#include "insight/Thresholds.h"
#include "platform/TelephonyService.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <string>
#include <vector>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::Each;
using testing::ElementsAre;
using testing::IsEmpty;

Value dbm(double level)
{
    return formatted("%.2f dBm", level);
}

class TrendSheetTest : public testing::Test, public FilledHistory {
protected:
    TrendSheetTest() : FilledHistory(kVoxLogChannelTechnology_Zephra_LTE) {}

    static Value display(Value power, const char* cell = "7")
    {
        return makeDictionary(
            {{"Serving Cell",
              makeDictionary({{"Serving Cell Measurements",
                               makeDictionary({{"Physical Cell ID", cell}, {"Measured RSRP", std::move(power)}})}})}});
    }
    void show(double power, std::chrono::microseconds after = 2s) { refresh(display(dbm(power)), after); }
    TrendSheet open(std::size_t row = 1) const
    {
        return {shown(), {"/Serving Cell/Serving Cell Measurements", row}, history, thresholds, clock};
    }
    static const SheetPart& part(const TrendSheet& sheet) { return sheet.contents().parts.at(0); }
    static const SheetPlot& plot(const TrendSheet& sheet) { return part(sheet).plot.value(); }
    /// Gaps are written as 999.
    static std::vector<double> means(const TrendSheet& sheet)
    {
        std::vector<double> all;
        for (const auto& each : plot(sheet).points)
            all.push_back(std::isnan(each.mean) ? 999 : each.mean);
        return all;
    }
    static std::vector<std::string> facts(const TrendSheet& sheet)
    {
        std::vector<std::string> all;
        for (const auto& each : part(sheet).facts)
            all.push_back(each.heading + ": " + each.value.text + (each.value.word.empty() ? "" : ", ") +
                          each.value.word);
        return all;
    }
    static void expectOrdered(const SheetPlot& plot)
    {
        EXPECT_TRUE(std::ranges::is_sorted(plot.points, {}, &SheetPlot::Point::at));
        EXPECT_TRUE(std::ranges::is_sorted(plot.marks, {}, &SheetPlot::Mark::at));
        double last = 0;
        for (const auto& each : plot.spans) {
            EXPECT_LE(last, each.from);
            EXPECT_LT(each.from, each.to);
            last = each.to;
        }
        EXPECT_LE(last, 1);
        EXPECT_LE(plot.points.size(), TrendSheet::kMostPoints);
    }

    const Thresholds thresholds;
};

TEST_F(TrendSheetTest, ShowsTheNumbersOfThe15MinutesOnTheScaleOfTheKey)
{
    show(-121);
    show(-98.25);
    const auto sheet = open();
    EXPECT_EQ(sheet.contents().title, "Measured RSRP");
    EXPECT_THAT(facts(sheet), ElementsAre("Now: -98.25 dBm, fair", "Least: -121 dBm, no service",
                                          "Mean: -109.62 dBm, poor", "Greatest: -98.25 dBm, fair"));
    EXPECT_THAT(means(sheet), ElementsAre(-121, -98.25));
    EXPECT_DOUBLE_EQ(plot(sheet).points[0].at, 1 - 2.0 / 900);
    EXPECT_EQ(plot(sheet).points[1].at, 1);
    EXPECT_EQ(plot(sheet).bottom, -140);
    EXPECT_EQ(plot(sheet).top, -44);
    EXPECT_THAT(plot(sheet).numbers, ElementsAre("-140 dBm", "-92 dBm", "-44 dBm"));
    EXPECT_THAT(plot(sheet).times, ElementsAre("05:50:46", "05:58:16", "06:05:46"));
    EXPECT_THAT(plot(sheet).ranges, ElementsAre("15 min", "1 h", "1 day"));
    EXPECT_EQ(plot(sheet).reading, "06:05:46  -98.25 dBm, fair");
    EXPECT_EQ(plot(sheet).sentence, "Measured RSRP, -98.25 dBm now, -121 to -98.25 in 15 minutes, rising");
    EXPECT_THAT(plot(sheet).spans, IsEmpty());
}

TEST_F(TrendSheetTest, BandsAreThoseOfTheThresholdsInUse)
{
    show(-98);
    const auto sheet = open();
    const auto* limits = thresholds.limitsOf(Measure::Rsrp);
    ASSERT_TRUE(limits);
    EXPECT_THAT(plot(sheet).bands,
                ElementsAre(SheetPlot::Band{-140, "no service"}, SheetPlot::Band{limits->poor, "poor"},
                            SheetPlot::Band{limits->fair, "fair"}, SheetPlot::Band{limits->good, "good"},
                            SheetPlot::Band{limits->excellent, "excellent"}));
}

TEST_F(TrendSheetTest, ValuesThatAreAbsentAndTimeWithoutRefreshesAreGaps)
{
    show(-98);
    refresh(display("Not Present"));
    show(-97);
    show(-96, 9s); // slow, but no gap
    show(-95, 60s);
    const auto sheet = open();
    EXPECT_THAT(means(sheet), ElementsAre(-98, 999, -97, -96, 999, -95));
    expectOrdered(plot(sheet));
    EXPECT_EQ(facts(sheet).at(0), "Now: -95 dBm, fair");
}

TEST_F(TrendSheetTest, AValueThatHasGoneShowsItsPast)
{
    show(-98);
    auto sheet = open();
    refresh(makeDictionary());
    EXPECT_TRUE(sheet.update(shown()));
    EXPECT_THAT(means(sheet), ElementsAre(-98, 999));
    EXPECT_EQ(facts(sheet).at(0), "Now: no value");
    EXPECT_EQ(facts(sheet).at(1), "Least: -98 dBm, fair");
}

TEST_F(TrendSheetTest, AValueThatHasNotComeYetIsAHint)
{
    refresh(display("Not Present"));
    auto sheet = open();
    EXPECT_THAT(sheet.contents().parts, IsEmpty());
    EXPECT_THAT(sheet.contents().hint, testing::StartsWith("There is nothing to draw"));
    sheet.cursorMoved(0);
    sheet.rangeChosen(1);
    EXPECT_THAT(sheet.contents().parts, IsEmpty());
    show(-98);
    sheet.update(shown());
    EXPECT_THAT(means(sheet), ElementsAre(-98));
}

TEST_F(TrendSheetTest, LongRangesHaveLeastMeanAndGreatestOfEachMinute)
{
    for (int i = 0; i < 60; ++i)
        show(i % 2 == 0 ? -100 : -90);
    auto sheet = open();
    sheet.rangeChosen(1);
    EXPECT_EQ(plot(sheet).range, 1u);
    const auto& last = plot(sheet).points.back();
    EXPECT_EQ(last.least, -100);
    EXPECT_EQ(last.mean, -95);
    EXPECT_EQ(last.greatest, -90);
    EXPECT_THAT(plot(sheet).times, ElementsAre("05:07", "05:37", "06:07"));
    EXPECT_EQ(plot(sheet).reading, "06:07  -100 to -90, mean -95 dBm, fair");
    EXPECT_EQ(facts(sheet).at(0), "Now: -90 dBm, good");
    sheet.rangeChosen(2);
    EXPECT_EQ(plot(sheet).times.front(), "06:07");
    sheet.rangeChosen(3); // there is none
    EXPECT_EQ(plot(sheet).range, 2u);
}

TEST_F(TrendSheetTest, CursorStaysAtItsMomentWhileNewPointsCome)
{
    for (const double each : {-98, -97, -96})
        show(each);
    auto sheet = open();
    EXPECT_FALSE(plot(sheet).cursor);
    sheet.cursorMoved(1);
    EXPECT_EQ(plot(sheet).cursor, 1u);
    EXPECT_EQ(plot(sheet).reading, "06:05:46  -97 dBm, fair");
    for (int i = 0; i < 449; ++i)
        show(-80);
    sheet.update(shown());
    EXPECT_EQ(plot(sheet).cursor, 0u);
    EXPECT_EQ(plot(sheet).reading, "06:05:48  -96 dBm, fair") << "its own moment has left the plot";
    sheet.cursorMoved(100'000); // away
    EXPECT_FALSE(plot(sheet).cursor);
    EXPECT_EQ(plot(sheet).reading, "06:20:46  -80 dBm, excellent");
    expectOrdered(plot(sheet));
}

TEST_F(TrendSheetTest, EndsAtTheMomentThatIsShown)
{
    show(-98);
    show(-97);
    const auto frozen = history.moments().newest();
    show(-96);
    const TrendSheet sheet(shownAt(frozen), {"/Serving Cell/Serving Cell Measurements", 1}, history, thresholds, clock);
    EXPECT_THAT(means(sheet), ElementsAre(-98, -97));
    EXPECT_EQ(plot(sheet).times.back(), "06:05:46");
    EXPECT_EQ(facts(sheet).at(0), "Now: -97 dBm, fair");
    EXPECT_THAT(plot(sheet).sentence, testing::StartsWith("Measured RSRP, -97 dBm now, -98 to -97"));
}

TEST_F(TrendSheetTest, StatesAreAStripThatFollowsTheirTime)
{
    const auto state = [this](const char* text) {
        refresh(makeDictionary({{"RRC Info", makeDictionary({{"Mode", text}, {"Other", "a"}})}}));
    };
    for (const char* each : {"Idle", "Idle", "Connected", "", "Idle"})
        state(each);
    TrendSheet sheet(shown(), {"/RRC Info", 0}, history, thresholds, clock);
    const auto at = [](int seconds) { return testing::DoubleNear(1 + seconds / 900.0, 1e-9); };
    ASSERT_EQ(plot(sheet).spans.size(), 2u) << "the newest has just begun";
    EXPECT_EQ(plot(sheet).spans[0].text, "Idle");
    EXPECT_THAT(plot(sheet).spans[0].from, at(-8));
    EXPECT_THAT(plot(sheet).spans[0].to, at(-4));
    EXPECT_EQ(plot(sheet).spans[1].text, "Connected");
    EXPECT_THAT(plot(sheet).spans[1].to, at(-2)) << "no value is no state";
    EXPECT_THAT(plot(sheet).points, IsEmpty());
    EXPECT_THAT(plot(sheet).marks, IsEmpty());
    EXPECT_THAT(facts(sheet), ElementsAre("Now: Idle", "Since: 06:05:52"));
    EXPECT_EQ(plot(sheet).reading, "06:05:52  Idle");
    sheet.cursorMoved(1);
    EXPECT_EQ(plot(sheet).reading, "06:05:48  Connected");
    expectOrdered(plot(sheet));
}

TEST_F(TrendSheetTest, AnIdentityMarksItsChanges)
{
    for (const char* cell : {"7", "7", "8", "8"})
        refresh(display(dbm(-98), cell));
    const auto sheet = open(0);
    EXPECT_THAT(facts(sheet), ElementsAre("Now: 8", "Since: 06:05:48"));
    ASSERT_EQ(plot(sheet).marks.size(), 1u);
    EXPECT_EQ(plot(sheet).marks[0].text, "8");
    EXPECT_DOUBLE_EQ(plot(sheet).marks[0].at, 1 - 2.0 / 900);
}

TEST_F(TrendSheetTest, ChangesOfTheServingCellAreMarks)
{
    const auto serve = [this](const char* cell) {
        refresh(makeDictionary(
            {{"Serving Cell",
              makeDictionary({{"Serving Cell Measurements", makeDictionary({{"A", "b"}, {"Measured RSRP", dbm(-98)}})},
                              {"Serving Cell Info", makeDictionary({{"Cell Identity", cell},
                                                                    {"Physical Cell ID", cell},
                                                                    {"Download Frequency", "6300"}})}})}}));
    };
    recordedBefore = std::chrono::hours(24 * 30);
    for (const char* cell : {"1", "1", "2"})
        serve(cell);
    ASSERT_EQ(history.cells().size(), 2u);
    EXPECT_THAT(plot(open()).marks, ElementsAre(SheetPlot::Mark{1 - 4.0 / 900, ""}, SheetPlot::Mark{1, ""}));
}

TEST_F(TrendSheetTest, ANeighbourIsFollowedByItsIdentity)
{
    const auto neighbours = [this](std::initializer_list<std::pair<const char*, double>> rows) {
        auto cells = makeArray();
        for (const auto& [cell, level] : rows)
            cells->append(makeDictionary({{"Physical Cell ID", cell}, {"Filtered RSRP", dbm(level)}}));
        refresh(makeDictionary({{"Connected Mode", makeDictionary({{"Measured Neighbor Cells", cells}})}}));
    };
    neighbours({{"7", -90}, {"8", -100}});
    TrendSheet sheet(shown(), {"/Connected Mode/Measured Neighbor Cells/1", 1}, history, thresholds, clock);
    neighbours({{"8", -99}, {"7", -91}});
    neighbours({{"8", -98}});
    sheet.update(shown());
    EXPECT_EQ(sheet.contents().title, "Filtered RSRP (Physical Cell ID 8)");
    EXPECT_THAT(means(sheet), ElementsAre(-100, -99, -98));
}

TEST_F(TrendSheetTest, ANumberWithoutAScaleHasARoundOneAroundIt)
{
    const auto count = [this](const char* number) {
        refresh(makeDictionary({{"Counters", makeDictionary({{"Sent", number}, {"b", "c"}})}}));
    };
    count("12");
    TrendSheet sheet(shown(), {"/Counters", 0}, history, thresholds, clock);
    EXPECT_LT(plot(sheet).bottom, 12);
    EXPECT_GT(plot(sheet).top, 12);
    count("473");
    sheet.update(shown());
    EXPECT_EQ(plot(sheet).bottom, 0);
    EXPECT_EQ(plot(sheet).top, 600);
    EXPECT_THAT(plot(sheet).bands, IsEmpty());
    EXPECT_THAT(facts(sheet), ElementsAre("Now: 473", "Least: 12", "Mean: 242.5", "Greatest: 473"));
}

TEST_F(TrendSheetTest, AClockThatIsSetBackKeepsTheOrder)
{
    show(-98);
    show(-97);
    auto sheet = open();
    auto cell = open(0);
    for (const int minutes : {-60, 30, -120, 180, -60 * 24 * 400}) {
        refresh(display(dbm(-96), "8"), std::chrono::minutes(minutes));
        refresh(display(dbm(-96), "9"));
        for (std::size_t range = 0; range < 3; ++range)
            for (auto* each : {&sheet, &cell}) {
                each->update(shown());
                each->rangeChosen(range);
                each->cursorMoved(0);
                expectOrdered(plot(*each));
            }
        EXPECT_EQ(facts(sheet).at(0), "Now: -96 dBm, fair");
        EXPECT_EQ(facts(cell).at(0), "Now: 9");
    }
}

TEST_F(TrendSheetTest, ADayOfMinutesWithGapsIsBounded)
{
    for (int i = 0; i < 3000; ++i)
        show(-98, 1min + 35s);
    auto sheet = open();
    sheet.rangeChosen(2);
    expectOrdered(plot(sheet));
    EXPECT_GT(plot(sheet).points.size(), 1000u);
}

TEST_F(TrendSheetTest, ARowThatIsNotThereIsAHint)
{
    show(-98);
    const TrendSheet sheet(shown(), {"/no such pane", 3}, history, thresholds, clock);
    EXPECT_THAT(sheet.contents().parts, IsEmpty());
    const TrendSheet none({}, {"/", 0}, history, thresholds, clock);
    EXPECT_THAT(none.contents().parts, IsEmpty());
}

} // namespace
} // namespace kestrum
