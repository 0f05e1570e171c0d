// Displays that no modem should send: memory stays bounded, and so does the work, which is counted.
#include "insight/CellSheet.h"
#include "insight/EventSheet.h"
#include "insight/FilledHistory.h"
#include "insight/MeaningSheet.h"
#include "insight/Thresholds.h"
#include "insight/TrendSheet.h"
#include "platform/TelephonyService.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

namespace kestrum {
namespace {

using namespace std::chrono_literals;

class BadDisplays : public testing::Test, public FilledHistory {
protected:
    BadDisplays() : FilledHistory(kVoxLogChannelTechnology_IFX) {}

    /// All sheets, of rows of the pane.
    void openSheets(const std::string& path, std::size_t row)
    {
        sheets.push_back(std::make_unique<EventSheet>(history.events(), clock));
        sheets.push_back(std::make_unique<CellSheet>(history, clock));
        sheets.push_back(std::make_unique<MeaningSheet>(shown(), RowOfPane{path, row}, thresholds));
        sheets.push_back(std::make_unique<TrendSheet>(shown(), RowOfPane{path, row}, history, thresholds, clock));
    }
    void updateSheets()
    {
        const auto now = shown();
        for (const auto& each : sheets) {
            EXPECT_TRUE(each->update(now));
            each->cursorMoved(0);
            expectBounded(each->contents());
        }
    }
    static void expectBounded(const SheetContents& contents)
    {
        for (const auto& part : contents.parts) {
            EXPECT_LE(part.table.rows.size(), EventSheet::kMostRows);
            for (const auto& fact : part.facts)
                EXPECT_LE(fact.value.text.size(), 1000u);
            if (!part.plot)
                continue;
            EXPECT_LE(part.plot->points.size(), TrendSheet::kMostPoints);
            EXPECT_LE(part.plot->marks.size(), 2 * TrendSheet::kMostPoints);
            EXPECT_TRUE(std::ranges::is_sorted(part.plot->points, {}, &SheetPlot::Point::at));
        }
    }
    void expectBoundedHistory()
    {
        EXPECT_LE(history.trends().paths().size(), Trends::kMost);
        EXPECT_LE(history.moments().bytes(), Moments::Limits().bytes);
        EXPECT_LE(history.events().size(), Events::kMost);
        EXPECT_LE(history.cells().size(), Cells::kMost);
    }
    /// The keys "x0", "x1", ... with numbers.
    static DictionaryRef numbers(const std::string& x, std::size_t count)
    {
        auto all = makeDictionary();
        for (std::size_t i = 0; i < count; ++i)
            all->set(x + std::to_string(i), std::to_string(i) + " dBm");
        return all;
    }

    const Thresholds thresholds;
    std::vector<std::unique_ptr<SheetSource>> sheets;
};

TEST_F(BadDisplays, OfAnotherShapeAtEachRefresh)
{
    refresh(numbers("key", 100));
    openSheets("/", 0);
    for (std::size_t i = 0; i < 100; ++i) {
        const auto name = std::to_string(i);
        refresh(i % 3 == 0   ? Value(makeDictionary({{name, numbers("a" + name, 50)}, {"key0", "1 dBm"}}))
                : i % 3 == 1 ? Value(makeDictionary({{"key0", makeArray({numbers(name, 20), "x", Value()})}}))
                             : Value(makeDictionary({{"key0", name}, {name, "Serving"}, {kSortedKey, "1"}})));
        updateSheets();
    }
    expectBoundedHistory();
    EXPECT_GT(history.trends().dropped(), 0u);
}

TEST_F(BadDisplays, Of100000Keys)
{
    refresh(numbers("key", 100'000));
    EXPECT_EQ(history.trends().left(), 100'000 - Trends::kMost) << "no search among those that are left out";
    openSheets("/", 99'999);
    refresh(numbers("key", 100'000));
    updateSheets();
    EXPECT_EQ(sheets[2]->contents().title, "key99999");
    EXPECT_TRUE(sheets[3]->contents().parts.empty()) << "it is not followed";
    expectBoundedHistory();
}

TEST_F(BadDisplays, Of100000Rows)
{
    auto rows = makeDictionary();
    for (int i = 0; i < 100'000; ++i)
        rows->set(std::to_string(i), makeDictionary({{"ARFCN", "7"}, {"RSSI", "-60 dBm"}}));
    const Value display = makeDictionary({{"Neighbor Cells", rows}, {"b", "c"}});
    refresh(display);
    openSheets("/Neighbor Cells/99999", 1);
    refresh(display);
    updateSheets();
    expectBoundedHistory();
}

TEST_F(BadDisplays, OfKeysThatCollide)
{
    // As panes show them, all have the name "Level".
    auto level = makeDictionary({{kSortedKey, kSortedKey}});
    for (int i = 0; i < 1000; ++i)
        level->set(std::to_string(i) + ";Level", std::to_string(i) + " dBm");
    const Value display = makeDictionary({{"Serving Cell", level}, {"/Serving Cell/", level}, {"b", "c"}});
    refresh(display);
    openSheets("/Serving Cell", 3);
    for (int i = 0; i < 10; ++i) {
        refresh(display);
        updateSheets();
    }
    EXPECT_LE(history.trends().paths().size(), 3u);
    EXPECT_EQ(sheets[3]->contents().parts.at(0).plot->points.size(), 11u) << "one for each refresh";
}

TEST_F(BadDisplays, TooLargeForTheMoments)
{
    refresh(makeDictionary({{"a", "1 dBm"}, {"b", "c"}}));
    openSheets("/", 0);
    refresh(makeDictionary({{"a", "2 dBm"}, {"b", std::string(Moments::Limits().bytes, 'x')}}));
    EXPECT_EQ(history.moments().size(), 0u);
    updateSheets();
    EXPECT_EQ(history.trends().exact("/a").size(), 2u);
    expectBoundedHistory();
}

TEST_F(BadDisplays, WithAClockThatJumps)
{
    refresh(numbers("key", 10));
    openSheets("/", 3);
    for (const int hours : {-1, 5, -30, 24 * 365, -24 * 365 * 2, 0, 1}) {
        refresh(numbers("key", 10), std::chrono::hours(hours));
        updateSheets();
        refresh(numbers("key", 10), 2s);
        updateSheets();
    }
    expectBoundedHistory();
}

} // namespace
} // namespace kestrum
