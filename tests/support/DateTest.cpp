#include "support/Date.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

using namespace std::chrono;

constexpr Date kDate = sys_days(2026y / 11 / 16) + 6h + 5min + 42s + 123456us;

TEST(Date, HasOneTextForm)
{
    EXPECT_EQ(dateText(kDate), "2026-11-16 06:05:42 +0000");
    EXPECT_EQ(dateText(Date()), "1970-01-01 00:00:00 +0000");
    EXPECT_EQ(dateText(Date(-1us)), "1969-12-31 23:59:59 +0000");
    EXPECT_EQ(dateText(Date(sys_days(2024y / 2 / 29)) + 24h - 1us), "2024-02-29 23:59:59 +0000");
}

TEST(Date, InIso8601WithTheFractionCutOff)
{
    EXPECT_EQ(isoText(kDate), "2026-11-16T06:05:42Z");
    EXPECT_EQ(isoText(kDate, 3), "2026-11-16T06:05:42.123Z");
    EXPECT_EQ(isoText(kDate, 6), "2026-11-16T06:05:42.123456Z");
    EXPECT_EQ(isoText(Date(5ms), 3), "1970-01-01T00:00:00.005Z");
    EXPECT_EQ(isoText(Date(-1us), 6), "1969-12-31T23:59:59.999999Z");
}

TEST(Date, IsReadFromIso8601)
{
    EXPECT_EQ(dateFromIso("2026-11-16T06:05:42Z"), floor<seconds>(kDate));
    EXPECT_EQ(dateFromIso("0000-01-01T00:00:00Z"), Date(sys_days(0y / 1 / 1)));
    EXPECT_EQ(dateFromIso("9999-12-31T23:59:59Z"), Date(sys_days(9999y / 12 / 31)) + 86399s);
    EXPECT_EQ(dateFromIso("2024-02-29T00:00:00Z"), Date(sys_days(2024y / 2 / 29)));
}

TEST(Date, IsNotReadFromAnythingElse)
{
    for (const char* text :
         {"", "2026-11-16", "2026-11-16T06:05:42", "2026-11-16T06:05:42.1Z", "2026-11-16 06:05:42Z",
          "2026-11-16T06:05:42Zx", "2026-00-16T06:05:42Z", "2026-13-16T06:05:42Z", "2026-02-30T06:05:42Z",
          "2023-02-29T06:05:42Z", "2026-11-00T06:05:42Z", "2026-11-16T24:05:42Z", "2026-11-16T06:60:42Z",
          "2026-11-16T06:05:60Z", "-026-11-16T06:05:42Z", "+026-11-16T06:05:42Z", "2026--1-16T06:05:42Z",
          "2026-1 -16T06:05:42Z", "2026-11-16T0x:05:42Z"})
        EXPECT_FALSE(dateFromIso(text)) << text;
}

TEST(TimeStamp, CountsFrom1980InStepsOf1250Microseconds)
{
    EXPECT_EQ(dateFromTimeStamp(0), Date(sys_days(1980y / 1 / 6)));
    EXPECT_EQ(dateFromTimeStamp(std::uint64_t{800} << 16), Date(sys_days(1980y / 1 / 6)) + 1s);
    EXPECT_EQ(dateFromTimeStamp((std::uint64_t{1} << 16) + 0xFFFF), Date(sys_days(1980y / 1 / 6)) + 1250us);
    EXPECT_EQ(timeStampFromDate(Date(sys_days(1980y / 1 / 6)) + 1s), std::uint64_t{800} << 16);
}

TEST(TimeStamp, ComesBackToItsStep)
{
    EXPECT_EQ(dateFromTimeStamp(timeStampFromDate(kDate)), kDate - (kDate - Date(sys_days(1980y / 1 / 6))) % 1250us);
    constexpr std::uint64_t last = 0xFFFF'FFFF'FFFFull << 16;
    EXPECT_EQ(timeStampFromDate(dateFromTimeStamp(last)), last);
}

} // namespace
} // namespace kestrum
