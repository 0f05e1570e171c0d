#include "insight/Glance.h"
#include "platform/TelephonyService.h"

#include <gmock/gmock.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <set>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr const char* kList = "/Neighbor Cells";

KestrumModelNodeRef tree(const Value& display)
{
    PathDictionary paths;
    return KestrumModelNode::makeTreeFromObject(display, paths);
}

Value neighbour(const std::string& channel, const std::string& bsic, const std::string& level)
{
    return makeDictionary({{"ARFCN", channel}, {"BSIC", bsic}, {"RSSI", level}, {"C1", "7"}});
}

KestrumModelNodeRef display(std::vector<Value> neighbours, const char* servingLevel = "-53 dBm")
{
    return tree(
        makeDictionary({{"Serving Cell", makeDictionary({{"ARFCN", "60"}, {"BSIC", "28"}, {"RSSI", servingLevel}})},
                        {"Neighbor Cells", makeArray(std::move(neighbours))}}));
}

std::vector<std::string> headings(const SheetPart& part)
{
    std::vector<std::string> found;
    for (const auto& column : part.table.columns)
        found.push_back(column.unit.empty() ? column.heading : column.heading + " in " + column.unit);
    return found;
}

std::vector<std::string> texts(const SheetRow& row)
{
    std::vector<std::string> found;
    for (const auto& cell : row.cells)
        found.push_back(cell.text);
    return found;
}

/// The channel of each row of the list.
std::vector<std::string> channels(const SheetPart& part)
{
    std::vector<std::string> found;
    const auto column = std::ranges::find(part.table.columns, "ARFCN", &SheetColumn::heading);
    const auto index = static_cast<std::size_t>(column - part.table.columns.begin());
    for (const auto& row : part.table.rows)
        if (!row.isReference)
            found.push_back(index < row.cells.size() ? row.cells[index].text : std::string());
    return found;
}

class GlanceTest : public testing::Test {
protected:
    Thresholds thresholds;
    Glance glance{std::string(kVoxLogChannelTechnology_IFX), kList, thresholds};
};

TEST_F(GlanceTest, HasTheMostTellingColumnsFirstAndTheUnitsInTheirHeadings)
{
    ASSERT_TRUE(
        glance.update(*display({makeDictionary({{"Mine", "x"}, {"C1", "28"}, {"RSSI", "-76 dBm"}, {"ARFCN", "38"}})})));
    const auto part = glance.part();
    EXPECT_EQ(glance.title(), "Neighbor Cells");
    EXPECT_THAT(headings(part), ElementsAre("ARFCN", "RSSI in dBm", "C1", "Mine"));
    EXPECT_THAT(texts(part.table.rows.at(1)), ElementsAre("38", "-76", "28", "x"));
}

TEST_F(GlanceTest, HasTheServingCellFirstForComparison)
{
    ASSERT_TRUE(glance.update(*display({neighbour("38", "54", "-76 dBm")})));
    const auto row = glance.part().table.rows.at(0);
    EXPECT_TRUE(row.isReference);
    EXPECT_THAT(texts(row), ElementsAre("28", "60", "-53", ""));
}

TEST_F(GlanceTest, ShowsLevelsWithTheirPlaceOnTheScaleAndTheirGrade)
{
    ASSERT_TRUE(glance.update(*display({neighbour("38", "54", "-110 dBm"), neighbour("1", "2", "-48 dBm")})));
    const auto rows = glance.part().table.rows;
    EXPECT_EQ(rows.at(1).cells.at(2), (SheetCell{"-48", 1, "excellent"}));
    EXPECT_EQ(rows.at(2).cells.at(2).bar, 0);
    EXPECT_EQ(rows.at(2).cells.at(3).bar, std::nullopt) << "one bar in a row";
}

TEST_F(GlanceTest, DoesNotGradeTheLevelOfAnotherTechnologyAsOneOfGsm)
{
    const auto cell = [](const char* technology) {
        return makeDictionary({{"Technology", technology}, {"RSSI", "-60 dBm"}});
    };
    ASSERT_TRUE(glance.update(*display({cell("GSM"), cell("UMTS")})));
    const auto rows = glance.part().table.rows;
    EXPECT_EQ(rows.at(1).cells.at(1).word, "excellent");
    EXPECT_EQ(rows.at(2).cells.at(1).word, "");
}

TEST_F(GlanceTest, KeepsTheUnitInTheCellsWhereRowsDiffer)
{
    ASSERT_TRUE(glance.update(*display({neighbour("38", "54", "-76 dBm"), neighbour("1", "2", "-4 dB")})));
    EXPECT_THAT(headings(glance.part()), ElementsAre("BSIC", "ARFCN", "RSSI", "C1"));
    EXPECT_EQ(glance.part().table.rows.at(1).cells.at(2).text, "-4 dB");
}

TEST_F(GlanceTest, SortsByLevelAndPutsRowsWithoutOneLast)
{
    ASSERT_TRUE(glance.update(
        *display({neighbour("1", "", "Not Present"), neighbour("2", "", "-90 dBm"), neighbour("3", "", ""),
                  neighbour("4", "", "-100 dBm"), neighbour("5", "", "-9 dBm")})));
    EXPECT_THAT(channels(glance.part()), ElementsAre("5", "2", "4", "1", "3"));
    EXPECT_EQ(glance.part().table.sort, (SheetSort{2, true}));
}

TEST_F(GlanceTest, ChangesItsOrderOnlyEverySecondRefreshAndMarksIt)
{
    using enum SheetRow::Moved;
    const auto moved = [&] {
        std::vector<SheetRow::Moved> all;
        for (const auto& row : glance.part().table.rows)
            all.push_back(row.moved);
        return all;
    };
    const auto first = display({neighbour("1", "", "-60 dBm"), neighbour("2", "", "-70 dBm")});
    const auto turned = display({neighbour("2", "", "-50 dBm"), neighbour("1", "", "-60 dBm")});
    glance.update(*first);
    EXPECT_THAT(moved(), ElementsAre(No, No, No));
    glance.update(*turned);
    EXPECT_THAT(channels(glance.part()), ElementsAre("1", "2")) << "rows stay in place, whatever their index is";
    EXPECT_EQ(glance.part().table.rows.at(2).cells.at(2).text, "-50") << "the values are new";
    glance.update(*turned);
    EXPECT_THAT(channels(glance.part()), ElementsAre("2", "1"));
    EXPECT_THAT(moved(), ElementsAre(No, Up, Down));
    glance.update(*first);
    EXPECT_THAT(channels(glance.part()), ElementsAre("2", "1"));
    EXPECT_THAT(moved(), ElementsAre(No, No, No));
}

TEST_F(GlanceTest, NewRowsFollowUntilTheNextOrder)
{
    glance.update(*display({neighbour("1", "", "-60 dBm"), neighbour("2", "", "-70 dBm")}));
    const auto grown = display({neighbour("9", "", "-50 dBm"), neighbour("2", "", "-70 dBm")});
    glance.update(*grown);
    EXPECT_THAT(channels(glance.part()), ElementsAre("2", "9"));
    glance.update(*grown);
    EXPECT_THAT(channels(glance.part()), ElementsAre("9", "2"));
}

TEST_F(GlanceTest, SortsAtOnceByTheColumnThatTheUserChooses)
{
    glance.update(
        *display({neighbour("1", "5", "-60 dBm"), neighbour("10", "3", "-70 dBm"), neighbour("9", "4", "-80 dBm")}));
    glance.sortBy(1);
    EXPECT_THAT(channels(glance.part()), ElementsAre("1", "9", "10")) << "by number, the lowest first";
    glance.sortBy(1);
    EXPECT_THAT(channels(glance.part()), ElementsAre("10", "9", "1"));
    EXPECT_EQ(glance.part().table.sort, (SheetSort{1, true}));
    glance.sortBy(2);
    EXPECT_THAT(channels(glance.part()), ElementsAre("1", "10", "9"));
    glance.sortBy(99);
    EXPECT_EQ(glance.part().table.sort, (SheetSort{2, true}));
}

TEST_F(GlanceTest, FollowsTheChosenColumnWhileOthersComeAndGo)
{
    glance.update(*display({neighbour("1", "5", "-60 dBm")}));
    glance.sortBy(3);
    glance.update(*display({makeDictionary({{"ARFCN", "1"}, {"RSSI", "-60 dBm"}, {"C1", "7"}})}));
    EXPECT_EQ(glance.part().table.sort, (SheetSort{2, true}));
}

TEST_F(GlanceTest, CellsWithOneIdentityStayDifferentRows)
{
    ASSERT_TRUE(glance.update(*display({neighbour("1", "5", "-60 dBm"), neighbour("1", "5", "-70 dBm")})));
    const auto rows = glance.part().table.rows;
    ASSERT_EQ(rows.size(), 3u);
    EXPECT_NE(rows[1].identity, rows[2].identity);
}

TEST_F(GlanceTest, EmptyListSaysSoAndAListThatIsGoneCloses)
{
    ASSERT_TRUE(glance.update(*display({})));
    EXPECT_EQ(glance.part().note, "The list is empty.");
    EXPECT_FALSE(glance.update(*tree(makeDictionary({{"Other", "1"}}))));
    EXPECT_TRUE(glance.update(*tree(makeDictionary({{"Neighbor Cells", ""}})))) << "an empty list may be a text";
    EXPECT_THAT(channels(glance.part()), IsEmpty());
}

TEST_F(GlanceTest, PilotsAreRowsOfNameAndStrength)
{
    Glance pilots{std::string(kVoxLogChannelTechnology_Zephra_CDMA), "/1x/Active Set", thresholds};
    const auto set = makeDictionary({{"328", "(ref pilot) -9.07 dB"}, {"12", "-7.50 dB"}});
    ASSERT_TRUE(pilots.update(*tree(makeDictionary({{"1x", makeDictionary({{"Active Set", set}})}}))));
    const auto part = pilots.part();
    EXPECT_THAT(headings(part), ElementsAre("PN", "Ec/Io in dB"));
    EXPECT_THAT(texts(part.table.rows.at(0)), ElementsAre("12", "-7.50"));
    EXPECT_THAT(texts(part.table.rows.at(1)), ElementsAre("328", "(ref pilot) -9.07"));
    EXPECT_TRUE(part.table.rows.at(1).cells.at(1).bar);
    EXPECT_NE(part.table.rows.at(1).cells.at(1).word, "");
}

TEST_F(GlanceTest, ListsOfOtherTreesHaveTheirIndexAndTheirOwnKeys)
{
    Glance mine{std::string(kVoxLogChannelTechnology_IFX), "/Mine", thresholds};
    const auto list = makeArray({makeDictionary({{"Colour", "red"}}), makeDictionary({{"Size", "3"}})});
    ASSERT_TRUE(mine.update(*tree(makeDictionary({{"Mine", list}}))));
    EXPECT_THAT(headings(mine.part()), ElementsAre("#", "Colour", "Size"));
    EXPECT_THAT(texts(mine.part().table.rows.at(1)), ElementsAre("1", "", "3"));
    EXPECT_EQ(mine.part().table.sort, std::nullopt);
}

TEST_F(GlanceTest, IsOfferedForListsOnly)
{
    const auto offered = [](const char* path, const Value& value) {
        return isGlanceable(kVoxLogChannelTechnology_IFX, path, *tree(value));
    };
    EXPECT_TRUE(offered("/Any", makeArray({makeDictionary({{"a", "b"}})})));
    EXPECT_FALSE(offered("/Serving Cell", makeDictionary({{"ARFCN", "1"}})));
    EXPECT_FALSE(offered("/Any", makeDictionary()));
    EXPECT_TRUE(offered("/Neighbor Cells", makeDictionary())) << "a list of cells, before the first of them";
}

// Bad input

RC_GTEST_FIXTURE_PROP(GlanceTest, RowsStayWholeWhateverTheDisplayIs, ())
{
    for (int refresh = 0; refresh < 5; ++refresh) {
        std::vector<Value> rows;
        const auto count = *rc::gen::inRange(0, 12);
        for (int i = 0; i < count; ++i) {
            auto row = makeDictionary();
            for (const auto& key : *rc::gen::container<std::vector<std::string>>(
                     rc::gen::element<std::string>("ARFCN", "BSIC", "RSSI", "C1", "", "x", "0")))
                row->set(key,
                         *rc::gen::element<std::string>("", "7", "-70 dBm", "nan dBm", "Not Present", "1e9", "\xff"));
            rows.push_back(row->empty() ? Value("a text") : Value(row));
        }
        RC_ASSERT(glance.update(*display(rows)));
        if (*rc::gen::arbitrary<bool>())
            glance.sortBy(static_cast<std::size_t>(*rc::gen::inRange(0, 9)));
        const auto part = glance.part();
        std::set<std::string> identities;
        for (const auto& row : part.table.rows) {
            RC_ASSERT(row.cells.size() == part.table.columns.size());
            RC_ASSERT(identities.insert(row.identity).second);
        }
        RC_ASSERT(channels(part).size() == rows.size());
        if (part.table.sort)
            RC_ASSERT(part.table.sort->column < part.table.columns.size());
    }
}

/// Shows 20 refreshes, each of a display of a new shape.
template <typename MakeDisplay>
void expectBounded(Glance& glance, MakeDisplay makeDisplay)
{
    for (int refresh = 0; refresh < 20; ++refresh) {
        ASSERT_TRUE(glance.update(*makeDisplay(refresh)));
        const auto part = glance.part();
        ASSERT_LE(part.table.rows.size(), 501u);
        ASSERT_LE(part.table.columns.size(), 80u);
    }
}

TEST_F(GlanceTest, ManyRowsAreCutAndTheSheetSaysSo)
{
    std::vector<Value> rows;
    for (int i = 0; i < 100'000; ++i)
        rows.push_back(neighbour(std::to_string(i), "1", "-70 dBm"));
    expectBounded(glance, [list = display(rows)](int) { return list; });
    EXPECT_EQ(glance.part().note, "The first 500 of 100000 rows.");
}

TEST_F(GlanceTest, ManyKeysGiveAsManyColumnsAsAScreenNeeds)
{
    expectBounded(glance, [](int refresh) {
        auto row = makeDictionary();
        for (int i = 0; i < 5'000; ++i)
            row->set("key " + std::to_string(refresh) + "/" + std::to_string(i), "1 dBm");
        row->set("RSSI", "-70 dBm");
        return display({row});
    });
    const auto shown = headings(glance.part());
    EXPECT_EQ(shown.front(), "#");
    EXPECT_NE(std::ranges::find(shown, "RSSI in dBm"), shown.end()) << "a known key counts more than those before it";
}

TEST_F(GlanceTest, HundredThousandKeysInOneRowAreLookedAtOnce)
{
    auto row = makeDictionary();
    for (int i = 0; i < 100'000; ++i)
        row->set("key " + std::to_string(i), "1 dBm");
    expectBounded(glance, [list = display({row, row, row})](int) { return list; });
}

TEST_F(GlanceTest, LongTextsAreShortened)
{
    ASSERT_TRUE(
        glance.update(*display({neighbour(std::string(1'000'000, '7'), "é" + std::string(300, 'x'), "-70 dBm")})));
    const auto part = glance.part();
    for (const auto& cell : part.table.rows.at(1).cells)
        EXPECT_LE(cell.text.size(), 210u);
}

} // namespace
} // namespace kestrum
