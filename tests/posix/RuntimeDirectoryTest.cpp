#include "platform/posix/RuntimeDirectory.h"
#include "harness/Scratch.h"

#include <gmock/gmock.h>

#include <unistd.h>

namespace kestrum {
namespace {

using testing::HasSubstr;

TEST(RuntimeDirectory, IsTheNamedOneOrTheSessionsOrOneInTmp)
{
    const ScopedVariable session("XDG_RUNTIME_DIR", "/run/user/7");
    {
        const ScopedVariable named("KESTRUM_RUNTIME_DIR", "/named");
        EXPECT_EQ(runtimeDirectory(), "/named");
    }
    const ScopedVariable named("KESTRUM_RUNTIME_DIR", std::nullopt);
    EXPECT_EQ(runtimeDirectory(), "/run/user/7/kestrum");
    const ScopedVariable none("XDG_RUNTIME_DIR", std::nullopt);
    EXPECT_EQ(runtimeDirectory(), "/tmp/kestrum-" + std::to_string(::getuid()));
}

std::string problemOf(const std::string& directory)
{
    return secureRuntimeDirectory(directory).value_or(Problem()).text;
}

TEST(RuntimeDirectory, IsRefusedWhenAnotherUserOwnsIt)
{
    if (::geteuid() != 0)
        GTEST_SKIP() << "only root can give a directory away";
    const ScratchDirectory scratch;
    const auto theirs = scratch / "theirs";
    std::filesystem::create_directory(theirs);
    ASSERT_EQ(::chown(theirs.c_str(), 65534, 65534), 0);
    EXPECT_THAT(problemOf(theirs), HasSubstr("belongs to another user"));
}

TEST(RuntimeDirectory, ReportsWhyItCannotBeCreated)
{
    const ScratchDirectory scratch;
    writeFile(scratch / "file", "");
    EXPECT_THAT(problemOf(scratch / "file/inside"), HasSubstr("cannot create"));
    EXPECT_THAT(problemOf(scratch / "file"), HasSubstr("is not a directory"));
}

TEST(RuntimeDirectory, MayNotBeRelative)
{
    EXPECT_EQ(problemOf("run"), "the runtime directory run is not an absolute path");
    EXPECT_THAT(problemOf(""), HasSubstr("is not an absolute path"));
}

TEST(RuntimeDirectory, LeavesRoomForTheLongestSocketOfADisplay)
{
    const ScratchDirectory scratch;
    const auto ofLength = [&](std::size_t length) {
        return scratch / std::string(length - scratch.path().size() - 1, 'd');
    };
    // "/org.kestrum.vox.baseband-state-report.log.4194304" and the terminating zero, of 108 bytes.
    EXPECT_EQ(problemOf(ofLength(57)), "");
    EXPECT_THAT(problemOf(ofLength(58)), HasSubstr("too long: 58 bytes, the limit is 57"));
    EXPECT_FALSE(std::filesystem::exists(ofLength(58)));
}

} // namespace
} // namespace kestrum
