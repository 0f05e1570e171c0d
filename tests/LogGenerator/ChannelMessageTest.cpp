#include "platform/ChannelMessage.h"

#include "LogGenerator/Messages.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

TEST(ChannelMessage, OrdinaryRecordBearsItsOwnCode)
{
    const auto bytes = message(1, 0xB17F, {7});
    const auto read = ChannelMessage::read(bytes);
    ASSERT_TRUE(read);
    EXPECT_EQ(read->type, 1);
    EXPECT_EQ(read->logCode, 0xB17Fu);
    EXPECT_EQ(read->record.size(), 14u);
}

TEST(ChannelMessage, ExtraCodeRecordIsLifted)
{
    const auto bytes = message(0xFF, 2);
    EXPECT_EQ(ChannelMessage::read(bytes)->logCode, 0xFF0002u);
    EXPECT_EQ(ChannelMessage::read(bytes)->type, 0xFF);
}

TEST(ChannelMessage, TwelveBytesAreNone)
{
    auto bytes = message(1, 0xB17F);
    ASSERT_EQ(bytes.size(), 13u);
    EXPECT_TRUE(ChannelMessage::read(bytes));
    bytes.pop_back();
    EXPECT_FALSE(ChannelMessage::read(bytes));
    EXPECT_FALSE(ChannelMessage::read({}));
}

TEST(ChannelMessage, PrefixIsRemoved)
{
    auto bytes = message(1, 0xB17F, {7});
    bytes.insert(bytes.begin(), {std::byte{0x81}, std::byte{0x55}});
    const auto read = ChannelMessage::read(bytes);
    EXPECT_EQ(read->type, 1);
    EXPECT_EQ(read->logCode, 0xB17Fu);
    EXPECT_EQ(read->record.size(), 14u);
}

TEST(ChannelMessage, PrefixCountsForTheLeastLength)
{
    // 11 bytes follow the prefix. That is less than a header, but includes the type and the code.
    const auto bytes = bytesFrom({0x81, 0, 0xFF, 0, 0, 0x34, 0x12, 0, 0, 0, 0, 0, 0});
    ASSERT_EQ(bytes.size(), 13u);
    const auto read = ChannelMessage::read(bytes);
    ASSERT_TRUE(read);
    EXPECT_EQ(read->record.size(), 11u);
    EXPECT_EQ(read->logCode, 0xFF1234u);
}

TEST(ChannelMessage, OnlyOnePrefixIsRemoved)
{
    auto bytes = message(1, 0xB17F);
    bytes.insert(bytes.begin(), {std::byte{0x81}, std::byte{0}, std::byte{0x81}, std::byte{0}});
    EXPECT_EQ(ChannelMessage::read(bytes)->type, 0x81);
}

TEST(ChannelMessage, OtherTypesKeepTheirCode)
{
    EXPECT_EQ(ChannelMessage::read(message(2, 0x1234))->logCode, 0x1234u);
}

} // namespace
} // namespace kestrum
