#include "capture/RecentMessages.h"

#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <vector>

namespace kestrum {
namespace {

std::string written(const RecentMessages& recent)
{
    std::ostringstream stream;
    recent.writeTo(sinkTo(stream));
    return stream.str();
}

/// What the same messages make as a capture.
std::string capture(const std::vector<std::string>& messages)
{
    std::ostringstream stream;
    for (const auto& each : messages)
        writeKcap(sinkTo(stream), bytesOf(each));
    return stream.str();
}

TEST(RecentMessages, WritesThemAsACapture)
{
    RecentMessages recent;
    EXPECT_TRUE(recent.isEmpty());
    EXPECT_EQ(written(recent), "");
    recent.add(bytesOf("one"));
    recent.turn();
    recent.add(bytesOf("two"));
    EXPECT_FALSE(recent.isEmpty());
    EXPECT_EQ(written(recent), capture({"one", "two"}));
    EXPECT_EQ(written(recent), capture({"one", "two"})) << "writing takes nothing away";
}

TEST(RecentMessages, NotesWhereMessagesAreMissing)
{
    RecentMessages recent;
    recent.add(bytesOf("one"));
    recent.addGap(7);
    std::ostringstream stream;
    writeKcapGap(sinkTo(stream), 7);
    EXPECT_EQ(written(recent), capture({"one"}) + stream.str());
}

TEST(RecentMessages, OfEarlierTurnsGo)
{
    RecentMessages recent({.turns = 2});
    recent.add(bytesOf("one"));
    recent.turn();
    recent.add(bytesOf("two"));
    EXPECT_EQ(written(recent), capture({"one", "two"}));
    recent.turn();
    EXPECT_EQ(written(recent), capture({"two"}));
    recent.turn();
    EXPECT_TRUE(recent.isEmpty());
    EXPECT_EQ(recent.bytes(), 0u);
}

TEST(RecentMessages, AreBoundedInBytesToo)
{
    constexpr std::size_t kMost = 4 << 20;
    RecentMessages recent({.bytes = kMost});
    const std::string message(1000, 'x');
    for (int i = 0; i < 20'000; ++i) { // of one turn
        recent.add(bytesOf(message));
        ASSERT_LE(recent.bytes(), kMost);
    }
    const auto kept = written(recent).size();
    EXPECT_GT(kept, kMost / 2) << "the latest stay";
    EXPECT_EQ(kept % (message.size() + 4), 0u) << "whole messages";
    recent.add(bytesOf(std::string(2 * kMost, 'x')));
    EXPECT_LE(recent.bytes(), kMost) << "a message that is too long is not kept";
    recent.add(bytesOf("after"));
    EXPECT_EQ(written(recent), capture({"after"}));
}

TEST(RecentMessages, AreForgotten)
{
    RecentMessages recent;
    recent.add(bytesOf("one"));
    recent.clear();
    EXPECT_TRUE(recent.isEmpty());
    EXPECT_EQ(recent.bytes(), 0u);
    recent.add(bytesOf("two"));
    EXPECT_EQ(written(recent), capture({"two"}));
}

} // namespace
} // namespace kestrum
