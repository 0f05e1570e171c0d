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
    {u8(0), "Byte", decimalSigned32},
    {u16(1), "Word", decimalSigned16},
    {u8(3), "Colour", named<colour>},
};
static_assert(reach(kRows) == 4);

TEST(Rows, ShowEachFieldUnderItsKey)
{
    const auto bytes = bytesFrom({7, 0xFE, 0xFF, 1});
    Dictionary row;
    show(Record(bytes), kRows, row);
    EXPECT_EQ(Value(std::make_shared<Dictionary>(row)),
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
    EXPECT_EQ(decimalSigned32.text(0xFFFFFFFF), "-1");
    EXPECT_EQ(decimalUnsigned.text(0xFFFFFFFF), "4294967295");
    EXPECT_EQ(decimalSigned16.text(0x8000), "-32768");
    EXPECT_EQ(decimalSigned16.number(0x8000), -32768.0);
    EXPECT_EQ(decimalUnsigned.number(0xFFFFFFFF), 4294967295.0);
}

/// The list after that.
template <typename Append>
Value listOf(Append append)
{
    auto list = makeArray();
    append(*list);
    return list;
}

TEST(Lists, EndWhereTheRecordDoes)
{
    const auto bytes = bytesFrom({9, 1, 2, 3, 4, 5});
    EXPECT_EQ(listOf(listed(Record(bytes), Elements(1, 2), 200, u16(0), decimalSigned32)),
              Value(makeArray({"513", "1027"})));
}

TEST(Lists, EndAtTheirCount)
{
    const auto bytes = bytesFrom({1, 2, 3, 4});
    EXPECT_EQ(listOf(listed(Record(bytes), Elements(0, 1), 2, u8(0), decimalSigned32)), Value(makeArray({"1", "2"})));
}

TEST(Lists, MayOverlap)
{
    const auto bytes = bytesFrom({1, 2, 3});
    EXPECT_EQ(listOf(listed(Record(bytes), Elements(0, 1, 2), 9, u16(0), decimalSigned32)),
              Value(makeArray({"513", "770"})));
}

TEST(Lists, ElementsCanBeRows)
{
    constexpr Row kElement[] = {{u8(0), "Byte", decimalSigned32}};
    const auto bytes = bytesFrom({1, 2});
    EXPECT_EQ(listOf(listed(Record(bytes), Elements(0, 1), 2, kElement)),
              Value(makeArray({makeDictionary({{"Byte", "1"}}), makeDictionary({{"Byte", "2"}})})));
}

TEST(Lists, ElementsCanBeShownByAFunction)
{
    const auto bytes = bytesFrom({1, 2});
    const auto twice = [](Record element, Dictionary& row) {
        row.set("Twice", Reading(decimalSigned32, 2 * element.read(u8(0)).value_or(0)));
    };
    EXPECT_EQ(listOf(listed(Record(bytes), Elements(0, 1), 2, twice)),
              Value(makeArray({makeDictionary({{"Twice", "2"}}), makeDictionary({{"Twice", "4"}})})));
}

} // namespace
} // namespace kestrum
