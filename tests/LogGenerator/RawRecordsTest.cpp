#include "LogGenerator/RawRecords.h"

#include <gmock/gmock.h>

#include <string>

namespace kestrum {
namespace {

// Sixteen blocks of 4 bytes.
constexpr std::size_t kCapacity = 64;

std::string taken(RawRecords& records)
{
    return std::string(textOf(records.take().bytes));
}

TEST(RawRecords, GivesWhatWasAppendedSinceTheLastTime)
{
    RawRecords records(kCapacity);
    for (const auto* each : {"one", "two", "three"})
        records.append(bytesOf(each));
    EXPECT_EQ(taken(records), "onetwothree");
    EXPECT_EQ(taken(records), "");
    records.append(bytesOf("four"));
    EXPECT_EQ(taken(records), "four");
}

TEST(RawRecords, KeepsAllUpToTheCapacity)
{
    RawRecords records(kCapacity);
    for (int i = 0; i < 16; ++i)
        records.append(bytesOf("word"));
    const auto interval = records.take();
    EXPECT_EQ(interval.bytes.size(), kCapacity);
    EXPECT_EQ(interval.dropped, 0u);
}

TEST(RawRecords, HaveTheirWholeCapacityInEachInterval)
{
    RawRecords records(kCapacity);
    for (int interval = 0; interval < 3; ++interval) {
        for (int i = 0; i < 16; ++i)
            records.append(bytesOf("word"));
        EXPECT_EQ(records.take().dropped, 0u);
    }
}

TEST(RawRecords, DropsTheOldestWholeMessagesAndCountsThem)
{
    RawRecords records(kCapacity);
    std::string all;
    for (char letter = 'a'; letter <= 'z'; ++letter) {
        const std::string message(3, letter);
        records.append(bytesOf(message));
        all += message;
    }
    const auto interval = records.take();
    const std::string kept(textOf(interval.bytes));
    EXPECT_LE(kept.size(), kCapacity);
    EXPECT_GT(kept.size(), kCapacity - 8);
    EXPECT_EQ(interval.dropped * 3 + kept.size(), all.size());
    EXPECT_TRUE(all.ends_with(kept));
    EXPECT_EQ(records.take().dropped, 0u) << "counted once";
}

TEST(RawRecords, AreBoundedWhateverTheSizeOfTheMessages)
{
    for (const std::size_t size : {0u, 1u, 5u, 63u, 64u}) {
        RawRecords records(kCapacity);
        const std::string message(size, 'x');
        for (int i = 0; i < 1000; ++i)
            records.append(bytesOf(message));
        const auto interval = records.take();
        EXPECT_LE(interval.bytes.size(), kCapacity) << size;
        EXPECT_EQ(interval.bytes.size(), (1000 - interval.dropped) * size);
    }
}

TEST(RawRecords, KeepTheNewestMessageThoughItAloneIsLarger)
{
    RawRecords records(kCapacity);
    records.append(bytesOf("small"));
    const std::string large(100, 'L');
    records.append(bytesOf(large));
    EXPECT_EQ(taken(records), large);
}

TEST(RawRecords, GiveTheMemoryOfAFloodBack)
{
    RawRecords records;
    const std::vector<std::byte> message(1 << 20);
    for (int i = 0; i < 40; ++i)
        records.append(message);
    records.take();
    records.append(bytesOf("after it"));
    EXPECT_LE(records.take().bytes.capacity(), 2u << 20);
}

} // namespace
} // namespace kestrum
