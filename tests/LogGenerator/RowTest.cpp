#include "LogGenerator/Row.h"

#include "LogGenerator/Messages.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

std::string_view colour(std::uint32_t raw)
{
    static constexpr std::string_view kNames[] = {"red", "green"};
    return nameIn(kNames, raw);
}

constexpr Row kRows[] = {
    {u8(0), "Byte", decimal},
    {u16(1), "Word", decimalSigned16},
    {u8(3), "Colour", colour},
};
static_assert(reach(kRows) == 4);

TEST(Rows, ShowEachFieldUnderItsKey)
{
    const auto bytes = bytesFrom({7, 0xFE, 0xFF, 1});
    EXPECT_EQ(Value(shown(Record(bytes), kRows)),
              Value(makeDictionary({{"Byte", "7"}, {"Word", "-2"}, {"Colour", "green"}})));
}

TEST(Rows, FieldThatIsNotAllThereKeepsItsValue)
{
    auto shownBefore = makeDictionary({{"Word", "5"}, {"Colour", "red"}});
    show(Record(bytesFrom({7, 0xFE})), kRows, *shownBefore);
    EXPECT_EQ(Value(shownBefore), Value(makeDictionary({{"Byte", "7"}, {"Word", "5"}, {"Colour", "red"}})));
}

TEST(Rows, ValueBeyondTheNamesIsUnknown)
{
    EXPECT_EQ(colour(2), "Unknown");
    EXPECT_EQ(colour(0xFFFFFFFF), "Unknown");
}

TEST(Rows, WordsArePrintedAsTheirSignSays)
{
    EXPECT_EQ(decimal(0xFFFFFFFF), "-1");
    EXPECT_EQ(decimalUnsigned(0xFFFFFFFF), "4294967295");
    EXPECT_EQ(decimalSigned8(0x80), "-128");
    EXPECT_EQ(decimalSigned16(0x8000), "-32768");
}

TEST(Lists, EndWhereTheRecordDoes)
{
    const auto bytes = bytesFrom({9, 1, 2, 3, 4, 5});
    const auto found =
        listed(Record(bytes), Elements(1, 2), 200, [](Record each) { return Value(decimal(*each.read(u16(0)))); });
    EXPECT_EQ(found, (std::vector<Value>{"513", "1027"}));
}

TEST(Lists, EndAtTheirCount)
{
    const auto bytes = bytesFrom({1, 2, 3, 4});
    EXPECT_EQ(listed(Record(bytes), Elements(0, 1), 2, [](Record each) { return Value(decimal(*each.read(u8(0)))); }),
              (std::vector<Value>{"1", "2"}));
}

TEST(Lists, MayOverlap)
{
    const auto bytes = bytesFrom({1, 2, 3, 4});
    const auto found =
        listed(Record(bytes), Elements(0, 1, 2), 9, [](Record each) { return Value(decimal(*each.read(u8(1)))); });
    EXPECT_EQ(found, (std::vector<Value>{"2", "3", "4"}));
}

TEST(Lists, LeaveOutWhatIsNull)
{
    const auto bytes = bytesFrom({1, 2, 3});
    const auto found = listed(Record(bytes), Elements(0, 1), 3, [](Record each) {
        return each.read(u8(0)) == 2u ? Value() : Value(decimal(*each.read(u8(0))));
    });
    EXPECT_EQ(found, (std::vector<Value>{"1", "3"}));
}

TEST(Lists, ElementsCanBeRows)
{
    constexpr Row kElement[] = {{u8(0), "Byte", decimal}};
    const auto bytes = bytesFrom({1, 2});
    EXPECT_EQ(listed(Record(bytes), Elements(0, 1), 2, kElement),
              (std::vector<Value>{makeDictionary({{"Byte", "1"}}), makeDictionary({{"Byte", "2"}})}));
}

} // namespace
} // namespace kestrum
