#include "tools/Changes.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

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
    Changes changes{[this](std::string_view path, const Value& value) {
        told.push_back(std::string(path) + (value ? "=" + describe(value) : " gone"));
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

} // namespace
} // namespace kestrum::tools
