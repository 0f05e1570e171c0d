#include "support/FieldWriter.h"

#include <gmock/gmock.h>
#include <rapidcheck/gtest.h>

#include <array>
#include <stdexcept>
#include <vector>

namespace kestrum {
namespace {

using testing::ElementsAre;

/// Four bytes of `before`, after `field` was set to `value`.
std::vector<int> written(Field field, std::int64_t value, int before = 0)
{
    std::array<std::byte, 4> bytes;
    bytes.fill(static_cast<std::byte>(before));
    FieldWriter(bytes).set(field, value);
    std::vector<int> numbers;
    for (const auto byte : bytes)
        numbers.push_back(std::to_integer<int>(byte));
    return numbers;
}

TEST(FieldWriter, WritesLittleEndianNumbers)
{
    EXPECT_THAT(written(u8(3), 0x12), ElementsAre(0, 0, 0, 0x12));
    EXPECT_THAT(written(u16(1), 0x1234), ElementsAre(0, 0x34, 0x12, 0));
    EXPECT_THAT(written(u32(0), 0x12345678), ElementsAre(0x78, 0x56, 0x34, 0x12));
}

TEST(FieldWriter, WritesNegativeAndBigEndianNumbers)
{
    EXPECT_THAT(written(u16(0), -2), ElementsAre(0xFE, 0xFF, 0, 0));
    EXPECT_THAT(written(u16BigEndian(2), 0x1234), ElementsAre(0, 0, 0x12, 0x34));
}

TEST(FieldWriter, LeavesTheOtherBitsOfAWord)
{
    EXPECT_THAT(written(u32(0).bits(9, 17), 0, 0xFF), ElementsAre(0xFF, 0x01, 0xFC, 0xFF));
    EXPECT_THAT(written(u8(1).bit(7), 1), ElementsAre(0, 0x80, 0, 0));
}

TEST(FieldWriter, WritesNumbersOf64Bits)
{
    std::array<std::byte, 9> bytes{};
    FieldWriter(bytes).set64(1, 0x0102030405060708);
    for (int i = 0; i < 9; ++i)
        EXPECT_EQ(std::to_integer<int>(bytes[static_cast<std::size_t>(i)]), i == 0 ? 0 : 9 - i);
}

TEST(FieldWriter, CountsTheOffsetsOfAPartFromItsBeginning)
{
    std::array<std::byte, 4> bytes{};
    FieldWriter(bytes).part(2, 2).set(u8(1), 9);
    EXPECT_EQ(bytes[3], std::byte{9});
}

TEST(FieldWriter, RefusesNumbersThatTheBitsCannotHold)
{
    EXPECT_THROW(written(u8(0), 256), std::out_of_range);
    EXPECT_THROW(written(u8(0), -129), std::out_of_range);
    EXPECT_THROW(written(u8(0).bits(0, 3), 16), std::out_of_range);
    EXPECT_THROW(written(u32(0), std::int64_t{1} << 32), std::out_of_range);
}

TEST(FieldWriter, RefusesFieldsBeyondTheEnd)
{
    std::array<std::byte, 4> bytes{};
    FieldWriter writer(bytes);
    EXPECT_THROW(writer.set(u16(3), 0), std::out_of_range);
    EXPECT_THROW(writer.set64(0, 0), std::out_of_range);
    EXPECT_THROW(writer.part(2, 3), std::out_of_range);
    EXPECT_THROW(writer.part(2, 2).set(u8(2), 0), std::out_of_range);
    EXPECT_THROW(writer.part(2, SIZE_MAX), std::out_of_range);
}

RC_GTEST_PROP(FieldWriter, WritesWhatARecordReads, (std::uint32_t number, std::uint64_t longNumber))
{
    std::array<std::byte, 12> bytes{};
    FieldWriter(bytes).set(u32(0), number).set64(4, longNumber);
    RC_ASSERT(Record(bytes).read(u32(0)) == number);
    RC_ASSERT(Record(bytes).read64(4) == longNumber);
    RC_ASSERT(!Record(bytes).read64(5));
}

} // namespace
} // namespace kestrum
