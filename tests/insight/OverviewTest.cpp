#include "insight/Overview.h"
#include "platform/TelephonyService.h"
#include "sections/Measured.h"

#include <gmock/gmock.h>

#include <algorithm>

namespace kestrum {
namespace {

using testing::IsEmpty;
using testing::Not;

KestrumModelNodeRef tree(const Value& display)
{
    PathDictionary paths;
    return KestrumModelNode::makeTreeFromObject(display, paths);
}

/// The display after the technology's sample capture.
template <typename Generator>
KestrumModelNodeRef captured(const char* templateName, const char* capture)
{
    TechnologyRun<Generator> run(templateName);
    Measured measured;
    readCapture(capture, run, measured);
    return tree(run.display());
}

/// Each line: the caption, its facts, and the rows of its table.
std::vector<std::string> lines(const std::vector<SheetPart>& parts)
{
    std::vector<std::string> all;
    for (const auto& part : parts) {
        auto line = part.caption + ':';
        for (const auto& [heading, value] : part.facts)
            line += ' ' + heading + '=' + value.text + (value.bar ? "|" + value.word : std::string());
        all.push_back(line);
        for (const auto& row : part.table.rows) {
            line = row.isReference ? "S" : "-";
            for (const auto& cell : row.cells)
                line += ' ' + cell.text + (cell.bar ? "|" + cell.word : std::string());
            all.push_back(line);
        }
    }
    return all;
}

void collectTexts(const KestrumModelNode& node, std::vector<std::string>& texts)
{
    texts.push_back(node.displayName());
    if (node.value() != nullptr)
        texts.push_back(*node.value());
    if (node.childNodes() != nullptr)
        for (const auto& child : *node.childNodes())
            collectTexts(*child, texts);
}

/// The sheet says nothing that the panes do not say; a unit may stand in a heading.
void expectOnlyWhatThePanesHold(const std::vector<SheetPart>& parts, const KestrumModelNode& root)
{
    std::vector<std::string> texts;
    collectTexts(root, texts);
    const auto check = [&](const std::string& text) {
        EXPECT_TRUE(std::ranges::any_of(texts, [&](const auto& each) { return each.starts_with(text); })) << text;
    };
    for (const auto& part : parts) {
        for (const auto& fact : part.facts)
            check(fact.value.text);
        for (const auto& row : part.table.rows)
            for (const auto& cell : row.cells)
                check(cell.text);
    }
}

class OverviewTest : public testing::Test {
protected:
    std::vector<std::string> overview(std::string_view technology, const KestrumModelNodeRef& root)
    {
        const auto parts = Overview(std::string(technology), thresholds).update(*root);
        expectOnlyWhatThePanesHold(parts, *root);
        return lines(parts);
    }

    Thresholds thresholds;
};

TEST_F(OverviewTest, Lte)
{
    EXPECT_THAT(
        overview(kVoxLogChannelTechnology_Zephra_LTE, captured<LTELogGenerator>("LTE", "lte")),
        testing::ElementsAre(
            "Serving cell: PCI=232 EARFCN=6300 Band=20 DL width=10 MHz TAC=5378 Cell=1712898 RSRP=-92.00 dBm|fair"
            " RSRQ=-7.25 dB|excellent RSSI=-64.50 dBm| Srxlev=32 dBm|excellent",
            "Neighbor Cells List: EARFCN=6300", "S 232 -92.00|fair -7.25 32 -91.50",
            "- 205 -98.50|fair -15.00 25 -98.50", "- 235 -100.50|poor -17.25 23 -101.00",
            "Reselection Candidates List:", "- LTE 1300 88 5"));
}

TEST_F(OverviewTest, Gsm)
{
    const auto shown = overview(kVoxLogChannelTechnology_Zephra_GSM, captured<ZPH_GSMLogGenerator>("ZPH_GSM", "gsm"));
    EXPECT_THAT(shown, testing::Contains("Network: MCC=1 MNC=1 LAC=4354 RAC=2 Service=CS_PS_SERVICE"));
    EXPECT_THAT(shown, testing::Contains("- 79 18 25|good 19"));
    EXPECT_THAT(shown, testing::Contains("Active Set: DL UARFCN=10687"));
}

TEST_F(OverviewTest, Utran)
{
    const auto shown = overview(kVoxLogChannelTechnology_Zephra_UTRAN2, captured<UTRANLogGenerator>("UTRAN", "utran"));
    EXPECT_THAT(shown, testing::Contains("State: RRC=Disconnected Access=All Calls"));
    EXPECT_THAT(shown, testing::Contains("- 107 10063 0.078125| MSET TRUE"));
}

TEST_F(OverviewTest, Cdma)
{
    const auto shown = overview(kVoxLogChannelTechnology_Zephra_CDMA, captured<C2KLogGenerator>("C2KTemplate", "cdma"));
    EXPECT_THAT(shown, testing::Contains("System: SID=16390 NID=3 Base=1753 Roaming=OFF [0]"));
    EXPECT_THAT(shown, testing::Contains("- 328 (ref pilot) -9.07|good"));
}

TEST_F(OverviewTest, OfATreeWithoutCellsIsEmpty)
{
    const auto root = tree(makeDictionary({{"a", "b"}, {"c", makeDictionary({{"d", "e"}})}}));
    for (const auto technology : {kVoxLogChannelTechnology_IFX, kVoxLogChannelTechnology_Zephra_LTE})
        EXPECT_THAT(overview(technology, root), IsEmpty());
    EXPECT_THAT(overview("unknown", root), IsEmpty());
}

TEST_F(OverviewTest, OfAHostileTreeLooksAtABoundedPart)
{
    auto wide = makeDictionary();
    for (int i = 0; i < 100'000; ++i)
        wide->set("node " + std::to_string(i), makeDictionary({{"Serving Cell", makeDictionary({{"ARFCN", "1"}})}}));
    auto deep = makeDictionary({{"ARFCN", "7"}});
    for (int i = 0; i < 400; ++i)
        deep = makeDictionary({{"Serving Cell", deep}});
    Overview shown{std::string(kVoxLogChannelTechnology_IFX), thresholds};
    for (int refresh = 0; refresh < 100; ++refresh) // a second if each reads the whole tree
        EXPECT_LE(shown.update(*tree(refresh % 2 == 0 ? makeDictionary({{"x", deep}}) : deep)).size(), 4u);
    const auto root = tree(wide);
    EXPECT_THAT(lines(shown.update(*root)), Not(IsEmpty()));
}

} // namespace
} // namespace kestrum
