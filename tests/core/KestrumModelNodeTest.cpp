#include "core/KestrumModelNode.h"

#include "doubles/CountedArrayLock.h"

#include <gmock/gmock.h>

#include <set>
#include <string>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::UnorderedElementsAre;

struct Tree {
    explicit Tree(const Value& object) : root(KestrumModelNode::makeTreeFromObject(object, paths)) {}

    const KestrumModelNode& at(const std::string& path) const { return *paths.find(path); }
    /// The paths of all rows; each leads to a node.
    std::set<std::string> allPaths() const
    {
        std::set<std::string> found;
        collect(*root, "/", found);
        for (const auto& path : found)
            EXPECT_NE(paths.find(path), nullptr) << path;
        return found;
    }

    PathDictionary paths;
    KestrumModelNodeRef root;

private:
    static void collect(const KestrumModelNode& node, const std::string& path, std::set<std::string>& into)
    {
        into.insert(path);
        if (node.childNodes() != nullptr)
            for (const auto& child : *node.childNodes())
                collect(*child, joinPath(path, child->displayName()), into);
    }
};

std::vector<std::string> rowNames(const KestrumModelNode& node)
{
    std::vector<std::string> names;
    for (const auto& child : *node.childNodes())
        names.push_back(child->displayName());
    return names;
}

Value sortedDictionary(std::initializer_list<Dictionary::Entry> entries)
{
    auto dictionary = makeDictionary({{"_sorted", "_sorted"}});
    for (const auto& [key, value] : entries)
        dictionary->set(key, value);
    return dictionary;
}

TEST(DisplayTree, RootIsNamedAfterTheApplication)
{
    const Tree tree(makeDictionary());
    EXPECT_EQ(tree.root->displayName(), "Kestrum");
    EXPECT_EQ(&tree.at("/"), tree.root.get());
}

TEST(DisplayTree, StringIsALeafWithItsText)
{
    const Tree tree(makeDictionary({{"RSSI", "-71 dBm"}}));
    const auto& leaf = tree.at("/RSSI");
    EXPECT_EQ(leaf.displayName(), "RSSI");
    EXPECT_EQ(*leaf.value(), "-71 dBm");
    EXPECT_EQ(leaf.childNodes(), nullptr);
}

TEST(DisplayTree, InnerNodeHasNoValue)
{
    const Tree tree(makeDictionary({{"Cell", makeDictionary({{"RSSI", "-71 dBm"}})}}));
    EXPECT_EQ(tree.at("/Cell").value(), nullptr);
    EXPECT_THAT(rowNames(tree.at("/Cell")), ElementsAre("RSSI"));
    EXPECT_EQ(*tree.at("/Cell/RSSI").value(), "-71 dBm");
}

TEST(DisplayTree, DictionaryKeepsItsOwnOrderWhenNotSorted)
{
    const Tree tree(makeDictionary({{"b", "1"}, {"a", "2"}, {"c", "3"}}));
    EXPECT_THAT(rowNames(*tree.root), ElementsAre("b", "a", "c"));
}

TEST(DisplayTree, KeyWithSemicolonIsShownWholeWhenNotSorted)
{
    const Tree tree(makeDictionary({{"3;Neighbor", "x"}}));
    EXPECT_THAT(rowNames(*tree.root), ElementsAre("3;Neighbor"));
    EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/", "/3;Neighbor"));
}

TEST(SortedKeys, TenComesBeforeTwo)
{
    const Tree tree(sortedDictionary({{"2;y", "1"}, {"10;x", "2"}}));
    EXPECT_THAT(rowNames(*tree.root), ElementsAre("x", "y"));
}

TEST(SortedKeys, ElevenIndexesStandInStringOrder)
{
    auto display = makeDictionary({{"_sorted", "_sorted"}});
    for (int i = 0; i <= 10; ++i)
        display->set(std::to_string(i) + ";cell " + std::to_string(i), "x");
    const Tree tree(display);
    EXPECT_THAT(rowNames(*tree.root), ElementsAre("cell 0", "cell 1", "cell 10", "cell 2", "cell 3", "cell 4", "cell 5",
                                                  "cell 6", "cell 7", "cell 8", "cell 9"));
}

TEST(SortedKeys, CaseCounts)
{
    const Tree tree(sortedDictionary({{"b", "1"}, {"B", "2"}, {"a", "3"}, {"\xc3\xa4", "4"}}));
    EXPECT_THAT(rowNames(*tree.root), ElementsAre("B", "a", "b", "\xc3\xa4"));
}

TEST(SortedKeys, EqualFirstPartsAreOrderedByTheSecond)
{
    const Tree tree(sortedDictionary({{"1;b", "1"}, {"1", "2"}, {"1;a", "3"}}));
    EXPECT_THAT(rowNames(*tree.root), ElementsAre("1", "a", "b"));
}

TEST(SortedKeys, EqualPartsAreOrderedByTheWholeKey)
{
    for (const auto& display :
         {sortedDictionary({{"1;", "x"}, {"1", "x"}}), sortedDictionary({{"1", "x"}, {"1;", "x"}})})
        EXPECT_THAT(rowNames(*Tree(display).root), ElementsAre("1", ""));
}

TEST(SortedKeys, EqualNamesGiveTwoRowsAndThePathOfTheLast)
{
    const Tree tree(sortedDictionary({{"1;123", "later"}, {"0;123", "earlier"}}));
    EXPECT_THAT(rowNames(*tree.root), ElementsAre("123", "123"));
    EXPECT_EQ(*tree.root->childNodes()->at(0)->value(), "earlier");
    EXPECT_EQ(*tree.root->childNodes()->at(1)->value(), "later");
    EXPECT_EQ(&tree.at("/123"), tree.root->childNodes()->at(1).get());
    EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/", "/123"));
}

TEST(SortedKeys, MarkerAloneGivesAnInnerNodeWithoutRows)
{
    const Tree tree(sortedDictionary({}));
    ASSERT_NE(tree.root->childNodes(), nullptr);
    EXPECT_TRUE(tree.root->childNodes()->empty());
    EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/"));
}

TEST(SortedKeys, KeyOfThreePartsIsShownWhole)
{
    const Tree tree(sortedDictionary({{"a;b;c", "x"}}));
    EXPECT_THAT(rowNames(*tree.root), ElementsAre("a;b;c"));
    EXPECT_EQ(*tree.at("/a;b;c").value(), "x");
}

TEST(SortedKeys, NothingBehindTheSemicolonIsAnEmptyName)
{
    const Tree tree(sortedDictionary({{"3;", "x"}}));
    EXPECT_THAT(rowNames(*tree.root), ElementsAre(""));
    EXPECT_EQ(*tree.at("/(empty)").value(), "x");
}

TEST(SortedKeys, MarkerOfAnyKindTurnsSortingOn)
{
    const Tree tree(makeDictionary({{"b", "1"}, {"a", "2"}, {"_sorted", false}}));
    EXPECT_THAT(rowNames(*tree.root), ElementsAre("a", "b"));
}

TEST(SortedKeys, NullMarkerDoesNot)
{
    const Tree tree(makeDictionary({{"b", "1"}, {"a", "2"}, {"_sorted", Value()}}));
    EXPECT_THAT(rowNames(*tree.root), ElementsAre("b", "a"));
}

TEST(DisplayTree, NullUnderAKeyIsSkipped)
{
    const Tree tree(makeDictionary({{"a", Value()}, {"b", "x"}}));
    EXPECT_THAT(rowNames(*tree.root), ElementsAre("b"));
    EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/", "/b"));
}

TEST(DisplayTree, ArrayElementsAreNamedByTheirNumber)
{
    const Tree tree(makeDictionary({{"Cells", makeArray({"x", makeDictionary({{"RSSI", "y"}}), makeArray({"z"})})}}));
    EXPECT_THAT(rowNames(tree.at("/Cells")), ElementsAre("0", "1", "2"));
    EXPECT_THAT(tree.allPaths(),
                UnorderedElementsAre("/", "/Cells", "/Cells/0", "/Cells/1", "/Cells/1/RSSI", "/Cells/2", "/Cells/2/0"));
}

TEST(DisplayTree, EmptyArrayIsAnInnerNodeWithoutRows)
{
    const Tree tree(makeDictionary({{"Cells", makeArray()}}));
    ASSERT_NE(tree.at("/Cells").childNodes(), nullptr);
    EXPECT_TRUE(tree.at("/Cells").childNodes()->empty());
}

TEST(DisplayTree, SlashInANameBecomesPartOfThePath)
{
    const Tree tree(makeDictionary({{"RSCP/EcNo", makeDictionary({{"RSCP", "x"}})}}));
    EXPECT_THAT(rowNames(*tree.root), ElementsAre("RSCP/EcNo"));
    EXPECT_EQ(*tree.at("/RSCP/EcNo/RSCP").value(), "x");
}

TEST(DisplayTree, NamesThatJoinToTheSamePathKeepTheLastNode)
{
    const Tree tree(makeDictionary({{"a", makeDictionary({{"b", "nested"}})}, {"a/b", "flat"}}));
    EXPECT_EQ(*tree.at("/a/b").value(), "flat");
    EXPECT_EQ(*tree.at("/a").childNodes()->at(0)->value(), "nested");
}

TEST(DisplayTree, EmptyNameIsShownEmpty)
{
    const Tree tree(makeDictionary({{"", "x"}}));
    EXPECT_THAT(rowNames(*tree.root), ElementsAre(""));
    EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/", "/(empty)"));
}

class Unknown : public testing::TestWithParam<Value> {};

TEST_P(Unknown, IsALeafThatSaysSo)
{
    const Tree tree(makeArray({GetParam()}));
    EXPECT_EQ(*tree.at("/0").value(), "(unknown)");
    EXPECT_EQ(tree.at("/0").childNodes(), nullptr);
}

TEST_P(Unknown, AtTheTopToo)
{
    const Tree tree(GetParam());
    EXPECT_EQ(tree.root->displayName(), "Kestrum");
    EXPECT_EQ(*tree.root->value(), "(unknown)");
    EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/"));
}

INSTANTIATE_TEST_SUITE_P(Kinds, Unknown,
                         testing::Values(Value(42), Value(2.5), Value(true), Value(Date()), Value(Data()), Value()),
                         [](const auto& each) { return std::string(nameOf(each.param.kind())); });

TEST(DisplayTree, StringAtTheTopIsOneLeaf)
{
    const Tree tree("No service");
    EXPECT_EQ(tree.root->displayName(), "Kestrum");
    EXPECT_EQ(*tree.root->value(), "No service");
    EXPECT_THAT(tree.allPaths(), UnorderedElementsAre("/"));
}

TEST(DisplayTree, NodesOutliveTheirTree)
{
    auto display = makeDictionary({{"Cell", makeDictionary({{"RSSI", "-71 dBm"}})}});
    auto tree = std::make_unique<Tree>(display);
    const KestrumModelNodeRef cell = tree->paths.find("/Cell");
    tree.reset();
    display->clear();
    EXPECT_EQ(*cell->childNodes()->at(0)->value(), "-71 dBm");
}

TEST(DisplayTree, DeepestPropertyListIsBuilt)
{
    Value nested = "bottom";
    for (int level = 0; level < 512; ++level)
        nested = level % 2 == 0 ? Value(makeArray({nested})) : Value(makeDictionary({{"x", nested}}));
    const Tree tree(nested);
    EXPECT_EQ(tree.allPaths().size(), 513u);
}

TEST(DisplayTree, LongNamesInsideEachOtherCostNoMoreThanOnce)
{
    // 16 levels with names of 1 MB, then a thousand rows: their full paths would take 16 GB.
    auto rows = makeArray();
    for (int i = 0; i < 1000; ++i)
        rows->append("x");
    const std::string name(1'000'000, 'a');
    Value nested = rows;
    std::string path;
    for (int level = 0; level < 16; ++level) {
        nested = makeDictionary({{name, nested}});
        path.append("/").append(name);
    }
    const Tree tree(nested);
    EXPECT_EQ(tree.at(path).childNodes()->size(), 1000u);
    EXPECT_EQ(tree.paths.find(path + "/999"), tree.at(path).childNodes()->back());
}

TEST(DisplayTree, PathOfNoNodeLeadsNowhere)
{
    const Tree tree(makeDictionary({{"Cell", makeDictionary({{"RSSI", "x"}})}, {"Cells", "y"}}));
    for (const char* path : {"", "Cell", "//", "//Cell", "/Cell/", "/Cell/RSSI/x", "/Cel", "/Cellular", "/Cells/"})
        EXPECT_EQ(tree.paths.find(path), nullptr) << path;
    EXPECT_EQ(PathDictionary().find("/"), nullptr);
}

TEST(DisplayTree, NodeIsBuiltUnderAnyPath)
{
    PathDictionary paths;
    const auto node = buildNode("Cells", makeArray({makeDictionary({{"RSSI", "x"}})}), paths, "/LTE/Cells");
    EXPECT_EQ(paths.find("/LTE/Cells"), node);
    EXPECT_EQ(*paths.find("/LTE/Cells/0/RSSI")->value(), "x");
    EXPECT_EQ(paths.find("/LTE/Cells0"), nullptr);
    EXPECT_EQ(paths.find("/"), nullptr);
}

// The array lock while arrays are walked.

class WalkedArrays : public testing::Test {
protected:
    CountedArrayLock counts;
};

TEST_F(WalkedArrays, AreLockedOncePerWalk)
{
    const Tree tree(makeDictionary({{"a", makeArray({"x", "y"})}, {"b", makeArray()}}));
    EXPECT_EQ(counts.locked, 2);
    EXPECT_EQ(counts.unlocked, 2);
}

TEST_F(WalkedArrays, NestedOnesLockAgainAndAreReleasedOnce)
{
    const Tree tree(makeArray({makeArray({makeArray()}), makeDictionary({{"a", makeArray()}})}));
    EXPECT_EQ(counts.locked, 4);
    EXPECT_EQ(counts.unlocked, 1);
}

TEST_F(WalkedArrays, DictionariesAreNotLocked)
{
    const Tree tree(makeDictionary({{"a", makeDictionary({{"b", "x"}})}}));
    EXPECT_EQ(counts.locked, 0);
}

// Each row of each pane of a display with names in all ways that panes show.
void expectSteps(const Value& display, const Value& object, const KestrumModelNode& node, const std::string& path)
{
    for (std::size_t row = 0; node.childNodes() && row < node.childNodes()->size(); ++row) {
        const auto steps = stepsToRow(display, path, row);
        ASSERT_FALSE(steps.empty()) << path << " row " << row;
        const auto& key = steps.back();
        const Value value = object.array() ? (*object.array())[std::stoul(key)] : object.dictionary()->at(key);
        const auto& child = *(*node.childNodes())[row];
        if (child.value() != nullptr)
            EXPECT_EQ(value.text(), *child.value()) << path << " row " << row;
        else
            expectSteps(display, value, child, joinPath(path, child.displayName()));
    }
    EXPECT_TRUE(stepsToRow(display, path, 1000).empty());
}

TEST(StepsToRow, LeadToTheValueThatThePaneShows)
{
    const Value display = makeDictionary(
        {{kSortedKey, kSortedKey},
         {"10;Ten", "ten"},
         {"2;Cells", makeArray({"a", makeDictionary({{"Level", "1"}, {"/x/", makeDictionary({{"y", "2"}})}}), "c"})},
         {"Empty", Value()},
         {"a;b;c", makeDictionary({{"n;Name", "3"}, {"Name/of", makeDictionary({{"it", "4"}})}})}});
    PathDictionary paths;
    const auto root = KestrumModelNode::makeTreeFromObject(display, paths);
    expectSteps(display, display, *root, "/");
    EXPECT_EQ(stepsToRow(display, "/Cells/1/x", 0), (std::vector<std::string>{"2;Cells", "1", "/x/", "y"}));
    EXPECT_TRUE(stepsToRow(display, "/no such", 0).empty());
    EXPECT_TRUE(stepsToRow(display, "/Ten", 0).empty());
    EXPECT_TRUE(stepsToRow(Value(), "/", 0).empty());
}

} // namespace
} // namespace kestrum
