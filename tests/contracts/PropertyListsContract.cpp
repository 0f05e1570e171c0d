#include "contracts/Worlds.h"
#include "doubles/MemoryPropertyLists.h"
#include "harness/Scratch.h"
#include "platform/propertylist/PropertyListCodec.h"

#include <fstream>

namespace kestrum {
namespace {

using Stored = PropertyLists::Stored;

struct MemoryWorld {
    MemoryPropertyLists lists;

    std::string path(const char* name) const { return std::string("/") + name; }
    void layDown(const std::string& path) { lists.taken.insert(path); }
};

struct FileWorld {
    PropertyListCodec lists;
    ScratchDirectory directory;

    std::string path(const char* name) const { return directory / name; }
    static void layDown(const std::string& path) { std::ofstream(path) << "somebody's"; }
};

template <typename World>
class PropertyListsContract : public testing::Test {
protected:
    World world;
    PropertyLists& lists = world.lists;
    const Dictionary snapshot{{"Timestamp", "now"}, {"Data", makeArray({1, true, "text"})}};
};
using Worlds = testing::Types<MemoryWorld, FileWorld>;
TYPED_TEST_SUITE(PropertyListsContract, Worlds, DoubleOrAdapter);

TYPED_TEST(PropertyListsContract, WhatIsSerialisedIsParsed)
{
    const Value value = std::make_shared<Dictionary>(this->snapshot);
    const auto bytes = this->lists.toXml(value);
    ASSERT_TRUE(bytes);
    EXPECT_EQ(this->lists.parse(bytes->bytes()), value);
    EXPECT_EQ(this->lists.parseOver(bytes->bytes(), {}), value);
}

TYPED_TEST(PropertyListsContract, WhatIsParsedIsACopy)
{
    const auto bytes = this->lists.toXml(makeDictionary({{"a", 1}}));
    this->lists.parse(bytes->bytes()).dictionary()->set("a", 2);
    EXPECT_EQ(this->lists.parse(bytes->bytes()), Value(makeDictionary({{"a", 1}})));
}

TYPED_TEST(PropertyListsContract, NullHasNoXmlFormAndInvalidListsReadAsNull)
{
    EXPECT_FALSE(this->lists.toXml(Value()));
    EXPECT_TRUE(this->lists.parse(bytesOf("no list")).isNull());
    EXPECT_TRUE(this->lists.load(this->world.path("nothing")).isNull());
}

TYPED_TEST(PropertyListsContract, LeavesNullsOut)
{
    const Dictionary withNulls{{"a", Value()}, {"b", makeArray({Value(), 1})}, {"c", makeDictionary({{"d", Value()}})}};
    const Value without = makeDictionary({{"b", makeArray({1})}, {"c", makeDictionary()}});
    EXPECT_EQ(this->lists.parse(this->lists.toXml(std::make_shared<Dictionary>(withNulls))->bytes()), without);
    ASSERT_EQ(this->lists.write(withNulls, this->world.path("a")), Stored::Written);
    EXPECT_EQ(this->lists.load(this->world.path("a")), without);
}

TYPED_TEST(PropertyListsContract, EachLoadGivesANewCopyOfTheFile)
{
    ASSERT_EQ(this->lists.write(this->snapshot, this->world.path("a")), Stored::Written);
    const Value value = std::make_shared<Dictionary>(this->snapshot);
    const Value loaded = this->lists.load(this->world.path("a"));
    EXPECT_EQ(loaded, value);
    loaded.dictionary()->set("Timestamp", "changed");
    EXPECT_EQ(this->lists.load(this->world.path("a")), value);
}

TYPED_TEST(PropertyListsContract, TheLastFileThatWasWrittenIsReplacedAndNothingElse)
{
    const auto path = this->world.path("a");
    ASSERT_EQ(this->lists.write({{"first", 1}}, path), Stored::Written);
    ASSERT_EQ(this->lists.write({{"second", 2}}, path), Stored::Written);
    EXPECT_EQ(this->lists.load(path), Value(makeDictionary({{"second", 2}})));
    const auto taken = this->world.path("b");
    this->world.layDown(taken);
    EXPECT_EQ(this->lists.write(this->snapshot, taken), Stored::NameTaken);
    EXPECT_TRUE(this->lists.load(taken).isNull());
}

} // namespace
} // namespace kestrum
