#include "LogGenerator/C2K/Subpackets.h"

#include "doubles/RecordingLog.h"
#include "sections/RecordBuilder.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

struct Search {
    /// The offset of the subpacket in the record; empty when it is not found.
    std::optional<std::size_t> operator()(const RecordBuilder& built, std::uint32_t identifier)
    {
        const Record whole(built.bytes());
        const auto found = findSubpacket(whole, identifier, log);
        return found ? std::optional(whole.size() - found->size()) : std::nullopt;
    }

    RecordingLog log;
};

RecordBuilder packets(std::size_t length, unsigned count)
{
    return record(0x119C, length).u8(14, count);
}

TEST(Subpackets, AreFoundInAnyOrder)
{
    const auto built = packets(60, 3).u8(17, 4).u16(19, 10).u8(27, 1).u16(29, 20).u8(47, 2).u16(49, 13);
    Search search;
    EXPECT_EQ(search(built, 4), 17u);
    EXPECT_EQ(search(built, 1), 27u);
    EXPECT_EQ(search(built, 2), 47u);
    EXPECT_EQ(search(built, 3), std::nullopt);
    EXPECT_TRUE(search.log.lines.empty());
}

TEST(Subpackets, AreNotFoundWithoutACount)
{
    Search search;
    EXPECT_EQ(search(packets(40, 0).u8(17, 1).u16(19, 10), 1), std::nullopt);
}

TEST(Subpackets, OfTheSameIdentifierGiveTheFirst)
{
    Search search;
    EXPECT_EQ(search(packets(60, 2).u8(17, 1).u16(19, 10).u8(27, 1).u16(29, 10), 1), 17u);
}

TEST(Subpackets, BeyondTheCountAreNotLookedAt)
{
    Search search;
    EXPECT_EQ(search(packets(60, 1).u8(17, 1).u16(19, 10).u8(27, 2).u16(29, 10), 2), std::nullopt);
}

TEST(Subpackets, OfSizeZeroAreComparedAgainUntilTheCountIsReached)
{
    Search search;
    EXPECT_EQ(search(packets(60, 255).u8(17, 1).u16(19, 0), 2), std::nullopt);
    EXPECT_EQ(search(packets(60, 255).u8(17, 1).u16(19, 0), 1), 17u);
    EXPECT_TRUE(search.log.lines.empty());
}

TEST(Subpackets, MayClaimSeventeenBytesLessOneBeyondTheRecord)
{
    // In a record of 40 bytes an end of 56 is accepted, an end of 57 is not.
    Search search;
    EXPECT_EQ(search(packets(40, 1).u8(17, 1).u16(19, 39), 1), 17u);
    EXPECT_TRUE(search.log.lines.empty());
    EXPECT_EQ(search(packets(40, 1).u8(17, 1).u16(19, 40), 1), std::nullopt);
    EXPECT_EQ(search.log.errors(), std::vector<std::string>{"Log code error in subpkt#0: bad size (40)."});
}

TEST(Subpackets, OfABadSizeAreReportedWithTheirIndex)
{
    Search search;
    EXPECT_EQ(search(packets(60, 2).u8(17, 1).u16(19, 10).u8(27, 2).u16(29, 65535), 2), std::nullopt);
    EXPECT_EQ(search.log.errors(), std::vector<std::string>{"Log code error in subpkt#1: bad size (65535)."});
}

TEST(Subpackets, WhoseHeaderLiesBeyondTheRecordAreNotFound)
{
    // The second header would begin at 57 of 60 bytes, so three of its four bytes are present.
    Search search;
    EXPECT_EQ(search(packets(60, 2).u8(17, 1).u16(19, 40).u8(57, 2), 2), std::nullopt);
    EXPECT_TRUE(search.log.lines.empty());
}

TEST(Subpackets, InARecordOfThirteenBytesAreNotFound)
{
    Search search;
    EXPECT_EQ(search(record(0x119C, 13), 1), std::nullopt);
}

} // namespace
} // namespace kestrum
