// Round trips with another implementation: Python's plistlib.
#include "Lists.h"

#include <gtest/gtest.h>

#include <cmath>

namespace kestrum {
namespace {

class Peer : public testing::TestWithParam<const char*> {
protected:
    void SetUp() override
    {
        if (!peerIsThere())
            GTEST_SKIP() << "python3 is not installed";
    }
    /// Our reading of the list that plistlib writes for a Python expression.
    static Value fromPeer(const std::string& expression)
    {
        const auto read = parsed(peer(std::string("dump ") + GetParam(), expression));
        EXPECT_EQ(read.reason, "");
        return read.value;
    }
};

TEST_P(Peer, WritesIntegersThatWeRead)
{
    EXPECT_EQ(fromPeer("[0, 1, 255, 256, 65535, 65536, 2**32-1, 2**32, 2**63-1, 2**63, 2**64-1, -1, -128, -2**31, "
                       "-2**63]"),
              Value(makeArray({0, 1, 255, 256, 65535, 65536, 4294967295, 4294967296, INT64_MAX, 9223372036854775808u,
                               UINT64_MAX, -1, -128, -2147483648LL, INT64_MIN})));
}

TEST_P(Peer, WritesRealsAndBooleansThatWeRead)
{
    EXPECT_EQ(fromPeer("[0.1, -2.5, 1e300, 5e-324, float('inf'), float('-inf'), True, False]"),
              Value(makeArray({0.1, -2.5, 1e300, 5e-324, HUGE_VAL, -HUGE_VAL, true, false})));
    EXPECT_TRUE(std::isnan(fromPeer("float('nan')").real().value_or(0)));
}

TEST_P(Peer, WritesTextsThatWeRead)
{
    EXPECT_EQ(fromPeer("['', 'LTE', '<&>\"', 'a\\tb\\nc', 'd\\u00e9j\\u00e0', '\\u20ac', '\\U0001F600', 'x' * 70000, "
                       "'\\u00fc' * 70000]"),
              Value(makeArray({"", "LTE", "<&>\"", "a\tb\nc", "d\u00E9j\u00E0", "\u20AC", "\U0001F600",
                               std::string(70000, 'x'), repeated("\u00FC", 70000)})));
}

TEST_P(Peer, WritesDatesThatWeRead)
{
    using namespace std::chrono;
    EXPECT_EQ(fromPeer("[datetime.datetime(2026, 11, 16, 6, 5, 42), datetime.datetime(1980, 1, 6), "
                       "datetime.datetime(1, 1, 1), datetime.datetime(9999, 12, 31, 23, 59, 59)]"),
              Value(makeArray({Date(sys_days(2026y / 11 / 16) + 6h + 5min + 42s), Date(sys_days(1980y / 1 / 6)),
                               Date(sys_days(1y / 1 / 1)), Date(sys_days(9999y / 12 / 31) + 86399s)})));
}

TEST_P(Peer, WritesDataThatWeRead)
{
    EXPECT_EQ(fromPeer("[b'', b'a', b'ab', b'abc', bytes(range(256)) * 4]"), [] {
        std::string all;
        for (int i = 0; i < 1024; ++i)
            all += static_cast<char>(i);
        return Value(
            makeArray({Data(), Data(bytesOf("a")), Data(bytesOf("ab")), Data(bytesOf("abc")), Data(bytesOf(all))}));
    }());
}

TEST_P(Peer, WritesContainersThatWeReadInOrder)
{
    EXPECT_EQ(describe(fromPeer("{'b': [], 'a': {'\\u00e9': {}, 'x': [[[]]]}, 'c': [{'k': 'v'}, {'k': 'v'}]}")),
              "{\"b\": [], \"a\": {\"\u00E9\": {}, \"x\": [[[]]]}, \"c\": [{\"k\": \"v\"}, {\"k\": \"v\"}]}");
}

TEST_P(Peer, WritesThousandsOfObjectsThatWeRead)
{
    const auto read = fromPeer("{str(i): [i, {'text': 'number %d' % i}] for i in range(70000)}").dictionary();
    ASSERT_TRUE(read);
    EXPECT_EQ(read->size(), 70000u);
    EXPECT_EQ(read->at("69999"), Value(makeArray({69999, makeDictionary({{"text", "number 69999"}})})));
}

INSTANTIATE_TEST_SUITE_P(Form, Peer, testing::Values("XML", "BINARY"),
                         [](const auto& each) { return std::string(each.param); });

TEST(PeerReads, WhatWeWrite)
{
    if (!peerIsThere())
        GTEST_SKIP() << "python3 is not installed";
    using namespace std::chrono;
    const Value value = makeDictionary({
        {"z", makeArray({-1, INT64_MIN, INT64_MAX, std::uint64_t{1} << 63, UINT64_MAX})},
        {"a", makeArray({0.1, -0.0, 1e16, 3.0, HUGE_VAL, -HUGE_VAL, std::nan(""), true, false})},
        {"text", makeArray({"", " <&>\" ", "a\r\nb\tc", "\u00E9\u20AC\U0001F600", std::string("\0\x1B", 2)})},
        {"date", Date(sys_days(2026y / 11 / 16) + 6h + 5min + 42s)},
        {"data", makeArray({Data(), Data(bytesOf(std::string(60, 'k')))})},
        {"\u00FC", makeDictionary({{"e", makeArray()}, {"d", makeDictionary()}, {"null", Value()}})},
    });
    EXPECT_EQ(peer("repr", xmlOf(value)),
              "{'z': [-1, -9223372036854775808, 9223372036854775807, 9223372036854775808, 18446744073709551615], "
              "'a': [0.1, -0.0, 1e+16, 3.0, inf, -inf, nan, True, False], "
              "'text': ['', ' <&>\" ', 'a\\r\\nb\\tc', '\\xe9\\u20ac\\U0001f600', '\\ufffd\\ufffd'], "
              "'date': datetime.datetime(2026, 11, 16, 6, 5, 42), "
              "'data': [b'', b'kkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkkk'], "
              "'\\xfc': {'e': [], 'd': {}}}");
}

} // namespace
} // namespace kestrum
