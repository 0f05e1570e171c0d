#include "Lists.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

class Files : public testing::Test {
protected:
    ScratchDirectory scratch;
    PropertyListCodec codec;
    const Dictionary snapshot{{"Timestamp", "2026-11-16 06:05:42 +0000"}, {"Data", makeArray({Data(bytesOf("DLF"))})}};
};

TEST_F(Files, WhatIsWrittenIsLoaded)
{
    ASSERT_TRUE(codec.write(snapshot, scratch.file("a.kestrum")));
    EXPECT_EQ(codec.load(scratch.file("a.kestrum")), Value(std::make_shared<Dictionary>(snapshot)));
}

TEST_F(Files, MissingDirectoriesAreMade)
{
    ASSERT_TRUE(codec.write(snapshot, scratch.file("var/log/diagnostics/a.kestrum")));
    EXPECT_TRUE(codec.load(scratch.file("var/log/diagnostics/a.kestrum")));
}

TEST_F(Files, ASecondWriteReplacesTheFirst)
{
    ASSERT_TRUE(codec.write({{"long", std::string(5000, 'x')}}, scratch.file("a")));
    ASSERT_TRUE(codec.write({{"short", 1}}, scratch.file("a")));
    EXPECT_EQ(codec.load(scratch.file("a")), Value(makeDictionary({{"short", 1}})));
}

TEST_F(Files, NothingIsTouchedWhenTheListHasNoXmlForm)
{
    ASSERT_TRUE(codec.write(snapshot, scratch.file("a")));
    const std::string before = contentsOf(scratch.file("a"));
    const auto loop = makeArray();
    loop->append(loop);
    EXPECT_FALSE(codec.write({{"loop", loop}}, scratch.file("a")));
    EXPECT_FALSE(codec.write({{"loop", loop}}, scratch.file("new/b")));
    loop->clear();
    EXPECT_EQ(contentsOf(scratch.file("a")), before);
    EXPECT_FALSE(std::filesystem::exists(scratch.file("new")));
}

TEST_F(Files, AFullDiskIsAFailure)
{
    ASSERT_TRUE(std::filesystem::exists("/dev/full"));
    EXPECT_FALSE(codec.write(snapshot, "/dev/full")); // shows only when the buffer is emptied
    EXPECT_FALSE(codec.write({{"large", std::string(1 << 20, 'x')}}, "/dev/full"));
}

TEST_F(Files, ADirectoryIsNoFile)
{
    EXPECT_FALSE(codec.write(snapshot, scratch.path()));
    EXPECT_TRUE(codec.load(scratch.path()).isNull());
}

TEST_F(Files, AFileIsNoDirectory)
{
    std::ofstream(scratch.file("file")) << "here";
    EXPECT_FALSE(codec.write(snapshot, scratch.file("file/a.kestrum")));
    EXPECT_EQ(contentsOf(scratch.file("file")), "here");
}

TEST_F(Files, WhatIsNotThereIsNotLoaded)
{
    EXPECT_TRUE(codec.load(scratch.file("nothing")).isNull());
}

TEST_F(Files, WhatIsNoPropertyListIsNotLoaded)
{
    std::ofstream(scratch.file("text")) << "no list";
    EXPECT_TRUE(codec.load(scratch.file("text")).isNull());
}

TEST_F(Files, AnEndlessFileIsNotLoaded)
{
    EXPECT_TRUE(codec.load("/dev/zero").isNull());
}

} // namespace
} // namespace kestrum
