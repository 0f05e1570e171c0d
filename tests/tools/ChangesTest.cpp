#include "tools/Changes.h"
#include "harness/Places.h"
#include "platform/posix/LinuxBundle.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "tools/Decoding.h"
#include "voxd/scenarios/Scenario.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>

namespace kestrum::tools {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::UnorderedElementsAre;

class ChangesTest : public testing::Test {
protected:
    std::vector<std::string> look(const Value& display)
    {
        told.clear();
        changes.look(display);
        return told;
    }

    std::vector<std::string> told;
    Changes changes{[this](const Changes::Change& change) {
        EXPECT_EQ(change.text, change.value.text().value_or(""));
        told.push_back(std::string(change.path) + (change.value ? "=" + describe(change.value) : " gone"));
    }};
};

TEST_F(ChangesTest, ReportsAllValuesAtFirst)
{
    const auto display =
        makeDictionary({{"_sorted", "_sorted"}, {"0;Cell", makeDictionary({{"MCC", "1"}})}, {"L", makeArray({"a"})}});
    EXPECT_THAT(look(display), ElementsAre("/0;Cell/MCC=\"1\"", "/L/0=\"a\""));
    EXPECT_THAT(look(display), IsEmpty());
}

TEST_F(ChangesTest, ReportsEditsOfTheSameContainer)
{
    const auto display = makeDictionary({{"a", "1"}, {"b", "2"}});
    look(display);
    display->set("b", "3");
    EXPECT_THAT(look(display), ElementsAre("/b=\"3\""));
}

TEST_F(ChangesTest, ReportsRemovedValues)
{
    look(makeDictionary({{"a", "1"}, {"b", makeDictionary({{"c", "2"}})}, {"l", makeArray({"x", "y", "z"})}}));
    EXPECT_THAT(look(makeDictionary({{"a", "1"}, {"l", makeArray({"x"})}})),
                UnorderedElementsAre("/b/c gone", "/l/1 gone", "/l/2 gone"));
}

TEST_F(ChangesTest, ReportsAValueThatBecomesATreeAndBack)
{
    look(makeDictionary({{"a", "1"}}));
    EXPECT_THAT(look(makeDictionary({{"a", makeDictionary({{"b", "2"}})}})), ElementsAre("/a gone", "/a/b=\"2\""));
    EXPECT_THAT(look(makeDictionary({{"a", makeArray({"3"})}})), ElementsAre("/a/b gone", "/a/0=\"3\""));
    EXPECT_THAT(look(makeDictionary({{"a", "1"}})), ElementsAre("/a/0 gone", "/a=\"1\""));
}

TEST_F(ChangesTest, EscapesKeysAsPointersDo)
{
    EXPECT_THAT(look(makeDictionary({{"C/I", makeDictionary({{"m~n", "1"}})}})), ElementsAre("/C~1I/m~0n=\"1\""));
}

TEST_F(ChangesTest, TakesADisplayThatIsOneText)
{
    EXPECT_THAT(look("text"), ElementsAre("=\"text\""));
}

TEST_F(ChangesTest, LooksOnlyAtTheNodesOfACode)
{
    const auto cell = makeDictionary({{"a", "1"}});
    const auto list = makeArray({"x"});
    const Value display = makeDictionary({{"C", cell}, {"L", list}});
    int asked = 0;
    const auto nodesOf = [&](LogCode code) {
        ++asked;
        return std::optional<std::vector<Value>>({code == 1 ? Value(cell) : Value(list)});
    };
    const auto lookAfter = [&](LogCode code) {
        told.clear();
        changes.look(display, code, nodesOf);
        return told;
    };
    EXPECT_THAT(lookAfter(1), ElementsAre("/C/a=\"1\"", "/L/0=\"x\""));
    EXPECT_THAT(lookAfter(2), IsEmpty());
    cell->set("a", "2");
    list->append("y");
    EXPECT_THAT(lookAfter(2), ElementsAre("/L/1=\"y\""));
    EXPECT_THAT(lookAfter(1), ElementsAre("/C/a=\"2\""));
    EXPECT_EQ(asked, 2);
}

TEST_F(ChangesTest, LooksAtAllOfAReplacedDisplay)
{
    const auto nodesOf = [](LogCode) { return std::optional<std::vector<Value>>(std::in_place); };
    changes.look(makeDictionary({{"a", "1"}}), 1, nodesOf);
    told.clear();
    changes.look(makeDictionary({{"b", "1"}}), 1, nodesOf);
    EXPECT_THAT(told, ElementsAre("/b=\"1\"", "/a gone"));
}

TEST_F(ChangesTest, LooksAtAllWhenANodeHasVanished)
{
    const auto display = makeDictionary({{"a", makeDictionary({{"b", "1"}})}});
    const auto nodesOf = [&](LogCode) { return std::optional(std::vector<Value>{display->at("a")}); };
    changes.look(display, 1, nodesOf);
    for (const auto* next : {"2", "3"}) {
        told.clear();
        display->set("a", makeDictionary({{"b", next}}));
        changes.look(display, 1, nodesOf);
        EXPECT_THAT(told, ElementsAre(std::string("/a/b=\"") + next + '"'));
    }
}

TEST_F(ChangesTest, ReportsReadingsByTheirTexts)
{
    static constexpr Quantity kHalves{[](Quantity::Raw raw) { return std::to_string(raw / 2); }};
    const auto display = makeDictionary();
    std::vector<std::string> all;
    for (const auto raw : {2u, 3u, 4u, 5u}) {
        display->set("a", Reading(kHalves, raw));
        std::ranges::copy(look(display), std::back_inserter(all));
    }
    display->set("a", "2");
    EXPECT_THAT(look(display), IsEmpty()) << "a string with the same text";
    EXPECT_THAT(all, ElementsAre("/a=\"1\"", "/a=\"2\""));
}

TEST_F(ChangesTest, KeysMayComeInAnotherOrder)
{
    look(makeDictionary({{"a", "1"}, {"b", "2"}, {"c", "3"}}));
    EXPECT_THAT(look(makeDictionary({{"c", "3"}, {"n", "4"}, {"a", "5"}, {"m", "6"}})),
                ElementsAre("/n=\"4\"", "/a=\"5\"", "/m=\"6\"", "/b gone"));
    EXPECT_THAT(look(makeDictionary({{"m", "6"}, {"n", "4"}, {"a", "5"}, {"c", "3"}})), IsEmpty());
}

TEST_F(ChangesTest, ReportsRowsThatComeBack)
{
    const auto row = [](const char* first, const char* second) {
        return makeDictionary({{first, "1"}, {second, "2"}});
    };
    const auto list = makeArray();
    look(list);
    for (int i = 0; i < 2000; ++i) { // many spares
        list->append(row("a", "b"));
        EXPECT_THAT(look(list), ElementsAre("/0/a=\"1\"", "/0/b=\"2\""));
        list->clear();
        EXPECT_THAT(look(list), ElementsAre("/0/a gone", "/0/b gone"));
    }
    list->append(row("b", "c"));
    EXPECT_THAT(look(list), ElementsAre("/0/b=\"1\"", "/0/c=\"2\""));
    list->clear();
    look(list);
    list->append(makeArray({"x"}));
    EXPECT_THAT(look(list), ElementsAre("/0/0=\"x\""));
}

class EveryScenario : public testing::TestWithParam<std::string_view> {};

// What a message changes outside the nodes of its code would be missing in the output.
TEST_P(EveryScenario, ChangesNothingOutsideTheNodesOfACode)
{
    std::vector<std::string> partly, fully;
    const auto into = [](std::vector<std::string>& told) {
        return [&told](const Changes::Change& change) {
            told.push_back(std::string(change.path) + (change.value ? "=" : " gone") + std::string(change.text));
        };
    };
    Changes ofNodes(into(partly)), ofAll(into(fully));
    LinuxBundle bundle{{inCheckout("resources")}};
    PropertyListCodec codec;
    std::size_t messages = 0;
    std::unique_ptr<Decoding> decoding;
    decoding = std::make_unique<Decoding>("", bundle, codec, nullptr, [&](const Decoding::Decoded& decoded) {
        ++messages;
        partly.clear();
        fully.clear();
        if (decoded.code)
            ofNodes.look(decoding->display(), *decoded.code, [&](LogCode code) { return decoding->nodesOf(code); });
        else
            ofNodes.look(decoding->display());
        ofAll.look(decoding->display());
        ASSERT_EQ(partly, fully) << "message " << messages;
    });
    const auto source = makeScenario(GetParam(), {5, *dateFromIso("2026-11-16T06:05:42Z"), codec});
    for (auto next = source->next(); next && next->at < std::chrono::seconds(100); next = source->next())
        ASSERT_NO_FATAL_FAILURE(decoding->take(next->bytes));
    EXPECT_GE(messages, 100u);
}

std::vector<std::string_view> scenarioNames()
{
    std::vector<std::string_view> names;
    std::ranges::transform(scenarios(), std::back_inserter(names), &Scenario::name);
    return names;
}

INSTANTIATE_TEST_SUITE_P(Scenarios, EveryScenario, testing::ValuesIn(scenarioNames()),
                         [](const auto& each) { return std::string(each.param); });

} // namespace
} // namespace kestrum::tools
