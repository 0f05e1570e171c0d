#include "capture/MessageTime.h"

#include "Messages.h"
#include "doubles/MemoryPropertyLists.h"
#include "platform/ChannelMessage.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

using namespace std::chrono;

constexpr Date kMoment = sys_days(2026y / 11 / 16) + 6h + 5min + 42s;

TEST(MomentFromText, TakesIso8601WithOrWithoutAFraction)
{
    EXPECT_EQ(momentFromText("2026-11-16T06:05:42Z"), kMoment);
    EXPECT_EQ(momentFromText("2026-11-16T06:05:42.5Z"), kMoment + 500ms);
    EXPECT_EQ(momentFromText("2026-11-16T06:05:42.000125Z"), kMoment + 125us);
    EXPECT_EQ(momentFromText("2026-11-16T06:05:42.1234567899999999999Z"), kMoment + 123456us);
    EXPECT_EQ(momentFromText("1970-01-01T00:00:00Z"), Date());
    EXPECT_EQ(momentFromText("2099-12-31T23:59:59.999999Z"), Date(sys_days(2100y / 1 / 1)) - 1us);
}

TEST(MomentFromText, TakesTheFormOfDisplayData)
{
    EXPECT_EQ(momentFromText("2026-11-16 06:05:42 +0000"), kMoment);
    EXPECT_EQ(momentFromText("2026-11-16 06:05:42.25 +0000"), kMoment + 250ms);
}

TEST(MomentFromText, TakesNothingElse)
{
    for (const std::string_view text : {"",
                                        "now",
                                        "2026-11-16",
                                        "2026-11-16T06:05:42",
                                        "2026-11-16T06:05:42.Z",
                                        "2026-11-16T06:05:42.5",
                                        "2026-11-16T06:05:42,5Z",
                                        "2026-11-16T06:05:42.5 Z",
                                        "2026-11-16T06:05:42.-5Z",
                                        "2026-11-16T06:05:42ZZ",
                                        "2026-11-16T06:05:42+01:00",
                                        "2026-11-16T06:05:42 +0000",
                                        "2026-11-16 06:05:42Z",
                                        "2026-11-16 06:05:42 +0100",
                                        "2026-11-16t06:05:42Z",
                                        "2026-13-16T06:05:42Z",
                                        "2026-11-16T24:05:42Z",
                                        "1969-12-31T23:59:59.999999Z",
                                        "2100-01-01T00:00:00Z",
                                        "9999-12-31T23:59:59Z",
                                        " 2026-11-16T06:05:42Z",
                                        "-026-11-16T06:05:42Z"})
        EXPECT_FALSE(momentFromText(text)) << text;
    EXPECT_FALSE(momentFromText({"2026-11-16T06:05:42\0Z", 21}));
    EXPECT_FALSE(momentFromText(std::string(1 << 20, '.')));
}

TEST(MessageTime, IsARecordsTimeStamp)
{
    MemoryPropertyLists lists;
    EXPECT_EQ(timeOf(bytesOf(message(0xB0C1, "")), lists), kMoment);
    EXPECT_EQ(timeOf(bytesOf(message(1, "", kStamp, 0xFF)), lists), kMoment);
    EXPECT_EQ(timeOf(bytesOf("\x81\x07" + message(0xB0C1, "")), lists), kMoment);
    EXPECT_FALSE(timeOf(bytesOf(message(0xB0C1, "", 0)), lists));
}

TEST(MessageTime, IsNotThereInFragmentsAndOtherTypes)
{
    MemoryPropertyLists lists;
    EXPECT_FALSE(timeOf(bytesOf(""), lists));
    EXPECT_FALSE(timeOf(bytesOf("fragment"), lists));
    EXPECT_FALSE(timeOf(bytesOf("\x81\x07" + message(0xB0C1, "").substr(0, 11)), lists));
    EXPECT_FALSE(timeOf(bytesOf(message(0xB0C1, "", kStamp, 7)), lists));
    EXPECT_FALSE(timeOf(bytesOf("<no list, but long enough>"), lists));
}

TEST(MessageTime, IsTheTextTimeAtTheRootOfATree)
{
    const Value time("2026-11-16T06:05:42Z");
    EXPECT_EQ(timeOf(Value(makeDictionary({{"Cell", "1"}, {"Time", time}}))), kMoment);
    MemoryPropertyLists lists;
    lists.parsed["<a list>"] = makeDictionary({{"Time", time}});
    EXPECT_EQ(timeOf(bytesOf("<a list>"), lists), kMoment);
}

TEST(MessageTime, IsNotThereInATreeWithoutAUsableText)
{
    const Value time("2026-11-16T06:05:42Z");
    EXPECT_FALSE(timeOf(Value()));
    EXPECT_FALSE(timeOf(time));
    EXPECT_FALSE(timeOf(Value(makeArray({time}))));
    EXPECT_FALSE(timeOf(Value(makeDictionary({{"time", time}}))));
    EXPECT_FALSE(timeOf(Value(makeDictionary({{"Cell", makeDictionary({{"Time", time}})}}))));
    for (const Value& bad : {Value(), Value("soon"), Value(1794809142), Value(1.5), Value(true), Value(kMoment),
                             Value(makeArray({"1", time})), Value(makeDictionary({{"Time", time}}))})
        EXPECT_FALSE(timeOf(Value(makeDictionary({{"Time", bad}})))) << bad;
}

} // namespace
} // namespace kestrum
