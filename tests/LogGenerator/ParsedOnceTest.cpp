#include "LogGenerator/ParsedOnce.h"

#include <gtest/gtest.h>

#include <utility>

namespace kestrum {
namespace {

/// Parses any bytes as a list with their text, except "none".
class CountingLists final : public PropertyLists {
public:
    Value parse(Bytes bytes) override
    {
        ++parsed;
        return textOf(bytes) == "none" ? Value() : Value(makeArray({Value(textOf(bytes))}));
    }
    Value parseOver(Bytes bytes, Value spentList) override
    {
        spent = std::move(spentList);
        return parse(bytes);
    }
    std::optional<Data> toXml(const Value&) const override { return Data(bytesOf("xml")); }
    Value load(const std::string& path) const override { return path; }
    Stored write(const Dictionary&, const std::string& path) const override
    {
        return path == "writable" ? Stored::Written : Stored::Failed;
    }

    int parsed = 0;
    Value spent;
};

TEST(ParsedOnce, ReadsEqualBytesOnce)
{
    CountingLists lists;
    ParsedOnce once(lists);
    const std::string first = "cells", again = "cells"; // equal bytes at different addresses
    const Value list = once.parse(bytesOf(first));
    EXPECT_EQ(list, Value(makeArray({"cells"})));
    EXPECT_EQ(once.parse(bytesOf(again)).array(), list.array());
    EXPECT_EQ(lists.parsed, 1);
}

TEST(ParsedOnce, ParsesOtherBytesAtTheSameAddressAgain)
{
    CountingLists lists;
    ParsedOnce once(lists);
    std::string buffer = "cells";
    once.parse(bytesOf(buffer));
    buffer = "files";
    EXPECT_EQ(once.parse(bytesOf(buffer)), Value(makeArray({"files"})));
}

TEST(ParsedOnce, OffersTheListThatItForgetsToTheNext)
{
    CountingLists lists;
    ParsedOnce once(lists);
    const Value first = once.parse(bytesOf("cells"));
    EXPECT_TRUE(lists.spent.isNull());
    once.parse(bytesOf("files"));
    EXPECT_EQ(lists.spent.array(), first.array());
}

TEST(ParsedOnce, RemembersThatBytesAreNone)
{
    CountingLists lists;
    ParsedOnce once(lists);
    EXPECT_TRUE(once.parse(bytesOf("none")).isNull());
    EXPECT_TRUE(once.parse(bytesOf("none")).isNull());
    EXPECT_EQ(lists.parsed, 1);
    EXPECT_FALSE(once.parse(bytesOf("cells")).isNull());
}

TEST(ParsedOnce, LeavesTheRestToTheListsBehindIt)
{
    CountingLists lists;
    ParsedOnce once(lists);
    EXPECT_EQ(textOf(once.toXml(Value("any"))->bytes()), "xml");
    EXPECT_EQ(once.load("path"), Value("path"));
    EXPECT_EQ(once.write({}, "writable"), PropertyLists::Stored::Written);
    EXPECT_EQ(once.write({}, "elsewhere"), PropertyLists::Stored::Failed);
}

} // namespace
} // namespace kestrum
