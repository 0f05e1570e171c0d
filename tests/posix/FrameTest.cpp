#include "platform/posix/Frame.h"
#include "posix/RawSocket.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

std::string written(const Frame& frame)
{
    std::vector<std::byte> bytes;
    appendFrame(bytes, frame);
    return std::string(textOf(bytes));
}

void feed(FrameReader& reader, std::string_view bytes)
{
    std::memcpy(reader.room(bytes.size()).data(), bytes.data(), bytes.size());
    reader.filled(bytes.size());
}

TEST(Frame, StandsByteByByteAsDocumented)
{
    EXPECT_EQ(written({Frame::Kind::Request, 0x01020304, 0xA1B2C3D4, bytesOf("hi")}),
              std::string("\x0B\0\0\0\x02\x04\x03\x02\x01\xD4\xC3\xB2\xA1hi", 15));
}

TEST(Frame, CarriesNegativeMessageIds)
{
    FrameReader reader;
    feed(reader, written({Frame::Kind::Message, -5, 0, {}}));
    const auto read = reader.next();
    ASSERT_TRUE(read);
    EXPECT_EQ(read->messageId, -5);
    EXPECT_TRUE(read->payload.empty());
}

TEST(FrameReader, FindsFramesHoweverTheStreamIsCut)
{
    const std::string stream = frame(kMessage, 0, 0, "one") + frame(kReply, 7, 9, "") + frame(kMessage, 1, 0, "three");
    for (std::size_t cut = 1; cut <= stream.size(); ++cut) {
        FrameReader reader;
        std::vector<std::string> payloads;
        for (std::size_t at = 0; at < stream.size(); at += cut) {
            feed(reader, std::string_view(stream).substr(at, cut));
            while (const auto each = reader.next())
                payloads.emplace_back(textOf(each->payload));
        }
        EXPECT_EQ(payloads, (std::vector<std::string>{"one", "", "three"})) << "in pieces of " << cut;
        EXPECT_EQ(reader.fault(), "");
    }
}

struct Malformed {
    const char* name;
    std::string bytes;
    const char* fault;

    friend void PrintTo(const Malformed& shown, std::ostream* out) { *out << shown.name; }
};

class MalformedFrame : public testing::TestWithParam<Malformed> {};

TEST_P(MalformedFrame, IsAFaultAtOnceAndForGood)
{
    FrameReader reader;
    feed(reader, frame(kMessage, 0, 0, "before") + GetParam().bytes);
    const auto before = reader.next();
    ASSERT_TRUE(before);
    EXPECT_EQ(textOf(before->payload), "before");
    EXPECT_FALSE(reader.next());
    EXPECT_EQ(reader.fault(), GetParam().fault);
    feed(reader, frame(kMessage, 0, 0, "after"));
    EXPECT_FALSE(reader.next());
}

INSTANTIATE_TEST_SUITE_P(
    FrameReader, MalformedFrame,
    testing::Values(Malformed{"LengthBelowTheHeader", std::string("\x08\0\0\0", 4),
                              "a frame of 8 bytes, outside the limits of 9 to 16777225"},
                    Malformed{"LengthZero", std::string("\0\0\0\0", 4),
                              "a frame of 0 bytes, outside the limits of 9 to 16777225"},
                    Malformed{"OneByteTooLong", std::string("\x0A\0\0\x01", 4),
                              "a frame of 16777226 bytes, outside the limits of 9 to 16777225"},
                    Malformed{"LargestLength", "\xFF\xFF\xFF\xFF",
                              "a frame of 4294967295 bytes, outside the limits of 9 to 16777225"},
                    Malformed{"KindZero", std::string("\x09\0\0\0\0", 5), "a frame of unknown kind 0"},
                    Malformed{"KindFour", std::string("\x09\0\0\0\x04", 5), "a frame of unknown kind 4"}),
    [](const auto& each) { return std::string(each.param.name); });

TEST(FrameReader, TakesThePayloadOfTheLargestSize)
{
    const std::string payload(16 << 20, 'x');
    FrameReader reader;
    feed(reader, frame(kMessage, 0, 0, payload));
    const auto read = reader.next();
    ASSERT_TRUE(read);
    EXPECT_EQ(read->payload.size(), payload.size());
}

TEST(FrameReader, TakesNoMemoryOnThePromiseOfALength)
{
    FrameReader reader;
    feed(reader, std::string("\x09\0\0\x01", 4)); // announces 16 MiB
    EXPECT_FALSE(reader.next());
    EXPECT_LT(reader.room(1).size(), 1024u);
}

} // namespace
} // namespace kestrum
