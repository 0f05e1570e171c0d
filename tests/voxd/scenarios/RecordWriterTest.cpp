#include "voxd/scenarios/RecordWriter.h"

#include <gmock/gmock.h>

#include <stdexcept>

namespace kestrum {
namespace {

using namespace std::chrono;
using testing::ElementsAre;

// One tick of 1.25 ms after the beginning of CDMA system time.
const Date kFirstTick = Date(sys_days(year(1980) / 1 / 6)) + microseconds(1250);

std::vector<int> written(RecordWriter record, bool prefixed = false)
{
    std::vector<int> bytes;
    for (const auto byte : std::move(record).message(kFirstTick, prefixed))
        bytes.push_back(std::to_integer<int>(byte));
    return bytes;
}

TEST(RecordWriter, WritesTheHeaderBeforeTheFields)
{
    EXPECT_THAT(written(RecordWriter(0xB0C2, 16).set(u8(13), 7).set(u16(14), 0x1234)),
                ElementsAre(1, 15, 0, 0xC2, 0xB0, 0, 0, 1, 0, 0, 0, 0, 0, 7, 0x34, 0x12));
}

TEST(RecordWriter, MarksRecordsOfTheTelephonyService)
{
    EXPECT_THAT(written(RecordWriter(0xFF0002, bytesOf("Hi"))),
                ElementsAre(0xFF, 14, 0, 2, 0, 0, 0, 1, 0, 0, 0, 0, 0, 'H', 'i'));
}

TEST(RecordWriter, PutsAPrefixBeforeTheRecord)
{
    EXPECT_THAT(written(RecordWriter(0x1183, 13), true),
                ElementsAre(0x81, 0, 1, 12, 0, 0x83, 0x11, 0, 0, 1, 0, 0, 0, 0, 0));
}

TEST(RecordWriter, CountsTheOffsetsOfAPartFromItsBeginning)
{
    auto record = RecordWriter(1, 16);
    record.part(14, 2).set(u8(1), 9);
    EXPECT_EQ(written(std::move(record)).back(), 9);
}

TEST(RecordWriter, RefusesFieldsBeyondItsEnd)
{
    auto record = RecordWriter(1, 16);
    EXPECT_THROW(record.set(u16(15), 0), std::out_of_range);
    EXPECT_THROW(record.part(14, 3), std::out_of_range);
}

TEST(Quantized, RoundsToStepsAndSaturates)
{
    EXPECT_EQ(quantized(-90.1, -140, 0.25, u32(0).bits(0, 8)), 200);
    EXPECT_EQ(quantized(-200, -140, 0.25, u32(0).bits(0, 8)), 0);
    EXPECT_EQ(quantized(0, -140, 0.25, u32(0).bits(0, 8)), 511);
}

} // namespace
} // namespace kestrum
