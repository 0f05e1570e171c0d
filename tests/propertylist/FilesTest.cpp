#include "Lists.h"
#include "platform/posix/WholeFile.h"

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
    ASSERT_EQ(codec.write(snapshot, scratch / "a.kestrum"), Stored::Written);
    EXPECT_EQ(codec.load(scratch / "a.kestrum"), Value(std::make_shared<Dictionary>(snapshot)));
}

TEST_F(Files, MissingDirectoriesAreMade)
{
    ASSERT_EQ(codec.write(snapshot, scratch / "var/log/diagnostics/a.kestrum"), Stored::Written);
    EXPECT_TRUE(codec.load(scratch / "var/log/diagnostics/a.kestrum"));
}

TEST_F(Files, ASecondWriteReplacesTheFirst)
{
    ASSERT_EQ(codec.write({{"long", std::string(5000, 'x')}}, scratch / "a"), Stored::Written);
    ASSERT_EQ(codec.write({{"short", 1}}, scratch / "a"), Stored::Written);
    EXPECT_EQ(codec.load(scratch / "a"), Value(makeDictionary({{"short", 1}})));
}

TEST_F(Files, NothingIsTouchedWhenTheListHasNoXmlForm)
{
    ASSERT_EQ(codec.write(snapshot, scratch / "a"), Stored::Written);
    const std::string before = contentsOf(scratch / "a");
    const auto loop = makeArray();
    loop->append(loop);
    EXPECT_EQ(codec.write({{"loop", loop}}, scratch / "a"), Stored::Failed);
    EXPECT_EQ(codec.write({{"loop", loop}}, scratch / "new/b"), Stored::Failed);
    loop->clear();
    EXPECT_EQ(contentsOf(scratch / "a"), before);
    EXPECT_FALSE(std::filesystem::exists(scratch / "new"));
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
        EXPECT_EQ(codec.write({{"large", std::string(1 << 20, 'x')}}, scratch / "a"), Stored::Failed);
    }
    EXPECT_TRUE(std::filesystem::is_empty(scratch.path()));
}

TEST_F(Files, AFullDiskLeavesTheFileThatWasThere)
{
    ASSERT_EQ(codec.write(snapshot, scratch / "a"), Stored::Written);
    const SmallDisk disk(200'000);
    EXPECT_EQ(codec.write({{"large", std::string(1 << 20, 'x')}}, scratch / "a"), Stored::Failed);
    EXPECT_EQ(codec.load(scratch / "a"), Value(std::make_shared<Dictionary>(snapshot)));
}

TEST_F(Files, AKilledWriterLeavesNoHalfFileUnderTheName)
{
    const auto child = ::fork();
    if (child == 0) {
        WholeFile file(scratch / "a");
        file.write(bytesOf(std::string(1 << 20, 'x')));
        std::raise(SIGKILL);
    }
    int status = 0;
    ::waitpid(child, &status, 0);
    ASSERT_TRUE(WIFSIGNALED(status));
    EXPECT_FALSE(std::filesystem::exists(scratch / "a"));
}

TEST_F(Files, OnlyTheirOwnerReadsThem)
{
    const auto mask = ::umask(0);
    ASSERT_EQ(codec.write(snapshot, scratch / "a"), Stored::Written);
    ::umask(mask);
    EXPECT_EQ(std::filesystem::status(scratch / "a").permissions(), std::filesystem::perms(0600));
}

TEST_F(Files, TwoWritersOfOneNameGetNoTwoFilesUnderIt)
{
    PropertyListCodec other;
    ASSERT_EQ(other.write({{"theirs", 1}}, scratch / "a"), Stored::Written);
    EXPECT_EQ(codec.write(snapshot, scratch / "a"), Stored::NameTaken);
    EXPECT_EQ(codec.load(scratch / "a"), Value(makeDictionary({{"theirs", 1}})));
}

TEST_F(Files, ALinkIsNotFollowed)
{
    std::ofstream(scratch / "somebody's") << "here";
    std::filesystem::create_symlink(scratch / "somebody's", scratch / "a");
    EXPECT_EQ(codec.write(snapshot, scratch / "a"), Stored::NameTaken);
    EXPECT_EQ(contentsOf(scratch / "somebody's"), "here");
}

TEST_F(Files, APipeDoesNotHoldTheWriterUp)
{
    ASSERT_EQ(::mkfifo((scratch / "a").c_str(), 0600), 0);
    EXPECT_EQ(codec.write(snapshot, scratch / "a"), Stored::NameTaken);
}

TEST_F(Files, ADirectoryIsNoFile)
{
    EXPECT_EQ(codec.write(snapshot, scratch.path()), Stored::NameTaken);
    EXPECT_TRUE(codec.load(scratch.path()).isNull());
}

TEST_F(Files, AFileIsNoDirectory)
{
    std::ofstream(scratch / "file") << "here";
    EXPECT_EQ(codec.write(snapshot, scratch / "file/a.kestrum"), Stored::Failed);
    EXPECT_EQ(contentsOf(scratch / "file"), "here");
}

TEST_F(Files, WhatIsNotThereIsNotLoaded)
{
    EXPECT_TRUE(codec.load(scratch / "nothing").isNull());
}

TEST_F(Files, WhatIsNoPropertyListIsNotLoaded)
{
    std::ofstream(scratch / "text") << "no list";
    EXPECT_TRUE(codec.load(scratch / "text").isNull());
}

TEST_F(Files, ReadingAndWritingHaveTheSameLimitOfSize)
{
    ASSERT_EQ(codec.write(snapshot, scratch / "a"), Stored::Written);
    const auto size = std::filesystem::file_size(scratch / "a");
    for (const bool fits : {true, false}) {
        PropertyListCodec small(fits ? size : size - 1);
        EXPECT_EQ(small.write(snapshot, scratch / (fits ? "b" : "c")), fits ? Stored::Written : Stored::Failed);
        EXPECT_EQ(!small.load(scratch / "a").isNull(), fits);
        EXPECT_EQ(small.parseWithError(bytesOf(contentsOf(scratch / "a"))).reason, fits ? "" : "too many bytes");
    }
    EXPECT_FALSE(std::filesystem::exists(scratch / "c"));
}

TEST_F(Files, AnEndlessFileIsNotLoaded)
{
    EXPECT_TRUE(codec.load("/dev/zero").isNull());
}

} // namespace
} // namespace kestrum
