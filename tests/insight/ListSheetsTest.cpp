// The sheets of events and of cells.
#include "insight/CellSheet.h"
#include "insight/EventSheet.h"

#include "insight/FilledHistory.h"
#include "platform/TelephonyService.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

/// The rows as "cell | cell | ...".
std::vector<std::string> rows(const SheetContents& contents)
{
    std::vector<std::string> all;
    for (const auto& row : contents.parts.at(0).table.rows) {
        all.push_back(row.cells.front().text);
        for (std::size_t i = 1; i < row.cells.size(); ++i)
            all.back() += " | " + row.cells[i].text;
    }
    return all;
}

class EventSheetTest : public testing::Test {
protected:
    void add(const char* is, std::optional<Date> at)
    {
        events.add({at, EventKind::Reselection, "LTE", "LTE cell 1", is, "RSRP -98.25 dBm"});
    }
    const SheetContents& contents()
    {
        EXPECT_TRUE(sheet.update({}));
        return sheet.contents();
    }

    VirtualClock clock;
    Events events;
    EventSheet sheet{events, clock};
};

TEST_F(EventSheetTest, WithoutEventsItSaysSo)
{
    EXPECT_EQ(contents().title, "Events");
    EXPECT_THAT(contents().parts, IsEmpty());
    EXPECT_THAT(contents().hint, testing::StartsWith("Nothing has happened yet."));
}

TEST_F(EventSheetTest, TheNewestIsFirstWithItsTimeAndLevels)
{
    add("LTE cell 2", clock.date);
    EXPECT_EQ(contents().parts.size(), 1u);
    add("GSM cell 3", clock.date + 3s);
    add("cell 4", std::nullopt);
    EXPECT_THAT(rows(contents()), ElementsAre(" | reselection (LTE) | cell 1 | cell 4 | RSRP -98.25 dBm",
                                              "06:05:45 | reselection (LTE) | cell 1 | GSM cell 3 | RSRP -98.25 dBm",
                                              "06:05:42 | reselection (LTE) | cell 1 | cell 2 | RSRP -98.25 dBm"));
    EXPECT_EQ(contents().parts[0].note, "");
}

TEST_F(EventSheetTest, AnEventOfAnotherDayHasItsDate)
{
    add("cell 2", clock.date);
    EXPECT_THAT(rows(contents()).at(0), testing::StartsWith("06:05:42 |"));
    clock.date += 24h;
    EXPECT_THAT(rows(contents()).at(0), testing::StartsWith("2026-11-16 06:05:42 |"));
}

TEST_F(EventSheetTest, RowsKeepTheirIdentity)
{
    add("cell 2", clock.date);
    const auto first = contents().parts[0].table.rows[0];
    add("cell 3", clock.date);
    const auto& now = contents().parts[0].table.rows;
    EXPECT_EQ(now[1], first);
    EXPECT_NE(now[0].identity, first.identity);
}

TEST_F(EventSheetTest, TheRowsAreBoundedAndTheRestIsCounted)
{
    for (int i = 0; i < 700; ++i)
        add("cell 2", clock.date);
    EXPECT_EQ(contents().parts[0].table.rows.size(), 700u);
    for (int i = 0; i < 700; ++i)
        add("cell 3", clock.date);
    EXPECT_EQ(contents().parts[0].table.rows.size(), 1000u);
    EXPECT_EQ(contents().parts[0].table.rows[700].cells[3].text, "cell 2");
    EXPECT_EQ(contents().parts[0].note, "The newest 1000 of 1400 events are shown. Keep (K) writes them all.");
    for (int i = 0; i < 20'000; ++i)
        add("cell 4", clock.date);
    EXPECT_EQ(contents().parts[0].table.rows.size(), 1000u);
    EXPECT_EQ(contents().parts[0].table.rows[999].cells[3].text, "cell 4");
    EXPECT_EQ(contents().parts[0].note, "The newest 1000 of 10000 events are shown. Keep (K) writes them all. "
                                        "11400 older ones are no longer listed.");
}

class CellSheetTest : public testing::Test, public FilledHistory {
protected:
    CellSheetTest() : FilledHistory(kVoxLogChannelTechnology_Zephra_LTE) {}

    void serve(const std::string& cell, const char* level, std::chrono::microseconds after = 2s)
    {
        refresh(
            makeDictionary({{"0;Serving Cell",
                             makeDictionary({{"Serving Cell Measurements", makeDictionary({{"Measured RSRP", level}})},
                                             {"Serving Cell Info", makeDictionary({{"Cell Identity", cell},
                                                                                   {"Physical Cell ID", "7"},
                                                                                   {"Download Frequency", "6300"}})}})},
                            {kSortedKey, kSortedKey}}),
            after);
    }
    const SheetContents& contents()
    {
        EXPECT_TRUE(sheet.update({}));
        return sheet.contents();
    }

    CellSheet sheet{history, clock};
};

TEST_F(CellSheetTest, WithoutCellsItSaysSo)
{
    EXPECT_EQ(contents().title, "Cells");
    EXPECT_THAT(contents().parts, IsEmpty());
    EXPECT_EQ(contents().hint, "No cell has served yet.");
}

TEST_F(CellSheetTest, TheServingCellIsFirstAndMarked)
{
    serve("1", "-100.00 dBm");
    serve("1", "-90.00 dBm");
    serve("2", "-95.50 dBm");
    EXPECT_THAT(rows(contents()),
                ElementsAre("LTE cell 2, PCI 7, EARFCN 6300 | 1 | 0.0 s | -95.5 dBm | -95.5 dBm | -95.5 dBm | 06:05:48",
                            "LTE cell 1, PCI 7, EARFCN 6300 | 1 | 4.0 s | -100 dBm | -95 dBm | -90 dBm | 06:05:48"));
    const auto& table = contents().parts[0].table;
    EXPECT_TRUE(table.rows[0].isReference);
    EXPECT_FALSE(table.rows[1].isReference);
    const auto identity = table.rows[1].identity;
    serve("1", "-90.00 dBm", 5min);
    EXPECT_EQ(contents().parts[0].table.rows[0].identity, identity);
    EXPECT_EQ(contents().parts[0].table.rows[0].cells[1].text, "2");
}

TEST_F(CellSheetTest, TheRowsAreBoundedAndTheRestIsCounted)
{
    for (int i = 0; i < 2100; ++i)
        serve(std::to_string(i), "-100.00 dBm");
    EXPECT_EQ(contents().parts[0].table.rows.size(), CellSheet::kMostRows);
    EXPECT_EQ(contents().parts[0].note, "500 of 2000 cells are shown. 100 older ones are no longer listed.");
}

} // namespace
} // namespace kestrum
