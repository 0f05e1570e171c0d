#include "Lists.h"
#include "platform/propertylist/WholeFile.h"

#include <gtest/gtest.h>

#include <csignal>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

namespace kestrum {
namespace {

using Stored = PropertyLists::Stored;

class Files : public testing::Test {
protected:
    ScratchDirectory scratch;
    PropertyListCodec codec;
    const Dictionary snapshot{{"Timestamp", "2026-11-16 06:05:42 +0000"}, {"Data", makeArray({Data(bytesOf("DLF"))})}};
};

TEST_F(Files, WhatIsWrittenIsLoaded)
{
    ASSERT_EQ(codec.write(snapshot, scratch.file("a.kestrum")), Stored::Written);
    EXPECT_EQ(codec.load(scratch.file("a.kestrum")), Value(std::make_shared<Dictionary>(snapshot)));
}

TEST_F(Files, MissingDirectoriesAreMade)
{
    ASSERT_EQ(codec.write(snapshot, scratch.file("var/log/diagnostics/a.kestrum")), Stored::Written);
    EXPECT_TRUE(codec.load(scratch.file("var/log/diagnostics/a.kestrum")));
}

TEST_F(Files, ASecondWriteReplacesTheFirst)
{
    ASSERT_EQ(codec.write({{"long", std::string(5000, 'x')}}, scratch.file("a")), Stored::Written);
    ASSERT_EQ(codec.write({{"short", 1}}, scratch.file("a")), Stored::Written);
    EXPECT_EQ(codec.load(scratch.file("a")), Value(makeDictionary({{"short", 1}})));
}

TEST_F(Files, NothingIsTouchedWhenTheListHasNoXmlForm)
{
    ASSERT_EQ(codec.write(snapshot, scratch.file("a")), Stored::Written);
    const std::string before = contentsOf(scratch.file("a"));
    const auto loop = makeArray();
    loop->append(loop);
    EXPECT_EQ(codec.write({{"loop", loop}}, scratch.file("a")), Stored::Failed);
    EXPECT_EQ(codec.write({{"loop", loop}}, scratch.file("new/b")), Stored::Failed);
    loop->clear();
    EXPECT_EQ(contentsOf(scratch.file("a")), before);
    EXPECT_FALSE(std::filesystem::exists(scratch.file("new")));
}

/// A disk on which a file can have at most this many bytes.
class SmallDisk {
public:
    explicit SmallDisk(::rlim_t bytes)
    {
        std::signal(SIGXFSZ, SIG_IGN);
        ::getrlimit(RLIMIT_FSIZE, &_before);
        const ::rlimit small{bytes, _before.rlim_max};
        ::setrlimit(RLIMIT_FSIZE, &small);
    }
    ~SmallDisk() { ::setrlimit(RLIMIT_FSIZE, &_before); }
    SmallDisk(const SmallDisk&) = delete;
    SmallDisk& operator=(const SmallDisk&) = delete;

private:
    ::rlimit _before{};
};

TEST_F(Files, AFullDiskLeavesNothing)
{
    {
        const SmallDisk disk(200'000);
        EXPECT_EQ(codec.write({{"large", std::string(1 << 20, 'x')}}, scratch.file("a")), Stored::Failed);
    }
    EXPECT_TRUE(std::filesystem::is_empty(scratch.path()));
}

TEST_F(Files, AFullDiskLeavesTheFileThatWasThere)
{
    ASSERT_EQ(codec.write(snapshot, scratch.file("a")), Stored::Written);
    const SmallDisk disk(200'000);
    EXPECT_EQ(codec.write({{"large", std::string(1 << 20, 'x')}}, scratch.file("a")), Stored::Failed);
    EXPECT_EQ(codec.load(scratch.file("a")), Value(std::make_shared<Dictionary>(snapshot)));
}

TEST_F(Files, AKilledWriterLeavesNoHalfFileUnderTheName)
{
    const auto child = ::fork();
    if (child == 0) {
        WholeFile file(scratch.file("a"));
        file.write(bytesOf(std::string(1 << 20, 'x')));
        std::raise(SIGKILL);
    }
    int status = 0;
    ::waitpid(child, &status, 0);
    ASSERT_TRUE(WIFSIGNALED(status));
    EXPECT_FALSE(std::filesystem::exists(scratch.file("a")));
}

TEST_F(Files, OnlyTheirOwnerReadsThem)
{
    const auto mask = ::umask(0);
    ASSERT_EQ(codec.write(snapshot, scratch.file("a")), Stored::Written);
    ::umask(mask);
    EXPECT_EQ(std::filesystem::status(scratch.file("a")).permissions(), std::filesystem::perms(0600));
}

TEST_F(Files, TwoWritersOfOneNameGetNoTwoFilesUnderIt)
{
    PropertyListCodec other;
    ASSERT_EQ(other.write({{"theirs", 1}}, scratch.file("a")), Stored::Written);
    EXPECT_EQ(codec.write(snapshot, scratch.file("a")), Stored::NameTaken);
    EXPECT_EQ(codec.load(scratch.file("a")), Value(makeDictionary({{"theirs", 1}})));
}

TEST_F(Files, ALinkIsNotFollowed)
{
    std::ofstream(scratch.file("somebody's")) << "here";
    std::filesystem::create_symlink(scratch.file("somebody's"), scratch.file("a"));
    EXPECT_EQ(codec.write(snapshot, scratch.file("a")), Stored::NameTaken);
    EXPECT_EQ(contentsOf(scratch.file("somebody's")), "here");
}

TEST_F(Files, APipeDoesNotHoldTheWriterUp)
{
    ASSERT_EQ(::mkfifo(scratch.file("a").c_str(), 0600), 0);
    EXPECT_EQ(codec.write(snapshot, scratch.file("a")), Stored::NameTaken);
}

TEST_F(Files, ADirectoryIsNoFile)
{
    EXPECT_EQ(codec.write(snapshot, scratch.path()), Stored::NameTaken);
    EXPECT_TRUE(codec.load(scratch.path()).isNull());
}

TEST_F(Files, AFileIsNoDirectory)
{
    std::ofstream(scratch.file("file")) << "here";
    EXPECT_EQ(codec.write(snapshot, scratch.file("file/a.kestrum")), Stored::Failed);
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

TEST_F(Files, TheLongestThatIsWrittenIsLoadedAndNothingLongerIsEither)
{
    ASSERT_EQ(codec.write(snapshot, scratch.file("a")), Stored::Written);
    const auto size = std::filesystem::file_size(scratch.file("a"));
    for (const bool fits : {true, false}) {
        PropertyListCodec small(fits ? size : size - 1);
        EXPECT_EQ(small.write(snapshot, scratch.file(fits ? "b" : "c")), fits ? Stored::Written : Stored::Failed);
        EXPECT_EQ(!small.load(scratch.file("a")).isNull(), fits);
        EXPECT_EQ(small.parseWithError(bytesOf(contentsOf(scratch.file("a")))).reason, fits ? "" : "too many bytes");
    }
    EXPECT_FALSE(std::filesystem::exists(scratch.file("c")));
}

TEST_F(Files, AnEndlessFileIsNotLoaded)
{
    EXPECT_TRUE(codec.load("/dev/zero").isNull());
}

} // namespace
} // namespace kestrum
