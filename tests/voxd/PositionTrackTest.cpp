#include "voxd/PositionTrack.h"

#include "capture/Messages.h"
#include "capture/PositionRecord.h"
#include "platform/propertylist/PropertyListCodec.h"

#include <gmock/gmock.h>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr Position kHere{3, 52.52, 13.4, 13.89, {}}, kElsewhere{2, -33.9, -18.4, {}, {}};

std::vector<std::byte> copied(std::string_view text)
{
    const Bytes bytes = bytesOf(text);
    return {bytes.begin(), bytes.end()};
}

class PositionTrackTest : public testing::Test {
protected:
    /// The position before a record at this time of the log: nothing, or what its record says.
    std::optional<std::optional<Position>> before(std::chrono::microseconds at)
    {
        Source::Message message{at, copied(record)};
        const auto given = track.accompany(message);
        EXPECT_EQ(textOf(message.bytes), record) << "a record stays as it is";
        if (!given)
            return std::nullopt;
        const auto read = ChannelMessage::read(*given);
        EXPECT_TRUE(read && read->logCode == kPositionRecord && read->timeStamp() == kStamp);
        return positionIn(lists.parse(read->record.from(ChannelMessage::kHeaderSize)->bytes()));
    }
    std::string treeWithPosition(std::string_view tree)
    {
        Source::Message message{0s, copied(tree)};
        EXPECT_FALSE(track.accompany(message));
        return std::string(textOf(message.bytes));
    }

    const std::string record = message(0xB0C1, "payload");
    PropertyListCodec lists;
    std::optional<Position> position;
    PositionTrack track{[this] { return position; }, lists};
};

TEST_F(PositionTrackTest, GivesAtMostOneRecordASecondOfTheLog)
{
    position = kHere;
    EXPECT_EQ(before(0ms), kHere);
    EXPECT_FALSE(before(1ms));
    position = kElsewhere;
    EXPECT_FALSE(before(999'999us));
    EXPECT_EQ(before(1000ms), kElsewhere);
    EXPECT_EQ(before(5500ms), kElsewhere);
    EXPECT_FALSE(before(6499ms));
    EXPECT_EQ(before(6500ms), kElsewhere);
}

TEST_F(PositionTrackTest, ReportsOnceThatThePositionIsLost)
{
    EXPECT_FALSE(before(0s)) << "it was never known";
    position = kHere;
    EXPECT_EQ(before(1s), kHere);
    position.reset();
    EXPECT_FALSE(before(1500ms));
    const auto lost = before(2s);
    ASSERT_TRUE(lost);
    EXPECT_FALSE(*lost);
    EXPECT_FALSE(before(4s));
    position = kElsewhere;
    EXPECT_EQ(before(4100ms), kElsewhere);
}

TEST_F(PositionTrackTest, AddsANodeToTrees)
{
    position = kHere;
    const auto tree =
        lists.parse(bytesOf(treeWithPosition("<plist><dict><key>Cell</key><string>1</string></dict></plist>")));
    EXPECT_EQ(tree, Value(makeDictionary({{"Cell", "1"}, {"Position", positionNode(kHere)}})));
    position.reset();
    const auto empty = lists.parse(bytesOf(treeWithPosition("<plist><dict/></plist>")));
    EXPECT_EQ(empty, Value(makeDictionary({{"Position", positionNode({})}})));
}

TEST_F(PositionTrackTest, LeavesOtherMessagesAsTheyAre)
{
    position = kHere;
    for (const std::string_view each : {"<plist><dict><key>Position</key><string>of the modem</string></dict></plist>",
                                        "<plist><array/></plist>", "<plist><dict>", "<", "fragment", ""})
        EXPECT_EQ(treeWithPosition(each), each);
}

} // namespace
} // namespace kestrum
