#include "support/Record.h"

#include <gtest/gtest.h>

#include <cstdint>

namespace kestrum {
namespace {

constexpr std::byte kBytes[] = {std::byte{0x12}, std::byte{0x34}, std::byte{0x56}, std::byte{0x78}, std::byte{0x9A}};

TEST(Record, WordsAreLittleEndian)
{
    const Record record(kBytes);
    EXPECT_EQ(record.read(u8(0)), 0x12u);
    EXPECT_EQ(record.read(u16(0)), 0x3412u);
    EXPECT_EQ(record.read(u32(0)), 0x78563412u);
    EXPECT_EQ(record.read(u32(1)), 0x9A785634u);
    EXPECT_EQ(record.read(u16BigEndian(1)), 0x3456u);
}

TEST(Record, BitsCountFromTheLeastSignificant)
{
    const Record record(kBytes);
    EXPECT_EQ(record.read(u8(0).bits(0, 3)), 0x2u);
    EXPECT_EQ(record.read(u8(0).bits(4, 7)), 0x1u);
    EXPECT_EQ(record.read(u16(0).bits(4, 11)), 0x41u);
    EXPECT_EQ(record.read(u32(0).bits(0, 31)), 0x78563412u);
    EXPECT_EQ(record.read(u32(0).bits(12, 20)), 0x163u);
    EXPECT_EQ(record.read(u32(0).bit(1)), 1u);
    EXPECT_EQ(record.read(u32(0).bit(31)), 0u);
    EXPECT_EQ(record.read(u16BigEndian(0).bits(8, 15)), 0x12u);
}

TEST(Record, NothingUnlessTheWholeWordIsThere)
{
    const Record record(kBytes);
    EXPECT_EQ(record.read(u8(4)), 0x9Au);
    EXPECT_FALSE(record.read(u8(5)));
    EXPECT_EQ(record.read(u16(3)), 0x9A78u);
    EXPECT_FALSE(record.read(u16(4)));
    EXPECT_FALSE(record.read(u32(2)));
    EXPECT_FALSE(record.read(u32(2).bits(0, 7))); // the byte is there, but its word is not
    EXPECT_FALSE(Record(Bytes()).read(u8(0)));
}

TEST(Record, OffsetsThatWouldWrapGiveNothing)
{
    const Record record(kBytes);
    EXPECT_FALSE(record.read(u32(SIZE_MAX - 1)));
    EXPECT_FALSE(record.slice(SIZE_MAX, 2));
    EXPECT_FALSE(record.slice(2, SIZE_MAX));
    EXPECT_FALSE(record.from(SIZE_MAX));
}

TEST(Record, SlicesCountFromTheirOwnStart)
{
    const auto part = Record(kBytes).slice(1, 3);
    ASSERT_TRUE(part);
    EXPECT_EQ(part->size(), 3u);
    EXPECT_EQ(part->read(u8(0)), 0x34u);
    EXPECT_EQ(part->read(u8(2)), 0x78u);
    EXPECT_FALSE(part->read(u8(3))); // the record continues, the slice does not
}

TEST(Record, SlicesMayBeEmpty)
{
    EXPECT_EQ(Record(kBytes).slice(5, 0)->size(), 0u);
    EXPECT_EQ(Record(kBytes).from(5)->size(), 0u);
    EXPECT_FALSE(Record(kBytes).from(6));
    EXPECT_FALSE(Record(kBytes).slice(5, 1));
    EXPECT_EQ(Record(kBytes).from(1)->read(u32(0)), 0x9A785634u);
}

TEST(Field, EndsBehindItsWord)
{
    EXPECT_EQ(u8(13).end(), 14u);
    EXPECT_EQ(u16(17).bits(0, 8).end(), 19u);
    EXPECT_EQ(u32(21).bits(15, 21).end(), 25u);
}

} // namespace
} // namespace kestrum
