#include "harness/Scratch.h"
#include "platform/posix/LinuxBundle.h"

#include <gmock/gmock.h>

#include <algorithm>
namespace kestrum {
namespace {

TEST(LinuxBundle, FindsResourcesInItsDirectoriesTheFirstHidingTheLater)
{
    const ScratchDirectory first, second;
    writeFile(first / "LTE.plist", "1");
    writeFile(second / "LTE.plist", "2");
    writeFile(second / "UTRAN.plist", "3");
    writeFile(second / "picture.png", "4");
    const LinuxBundle bundle({first.path(), second.path(), "/nowhere"});
    EXPECT_EQ(bundle.pathForResource("LTE", "plist"), first / "LTE.plist");
    EXPECT_EQ(bundle.pathForResource("UTRAN", "plist"), second / "UTRAN.plist");
    EXPECT_FALSE(bundle.pathForResource("ZPH_GSM", "plist"));
    EXPECT_THAT(bundle.pathsForResourcesOfType("plist"),
                testing::UnorderedElementsAre(first / "LTE.plist", second / "UTRAN.plist"));
    EXPECT_TRUE(std::ranges::is_sorted(bundle.pathsForResourcesOfType("plist")));
}

TEST(LinuxBundle, HasTheProgramsVersion)
{
    EXPECT_EQ(LinuxBundle().version(), "1.0.0");
}

TEST(LinuxBundle, LooksFirstWhereTheEnvironmentSays)
{
    const ScratchDirectory own;
    writeFile(own / "Mine.plist", "");
    const ScopedVariable variable("KESTRUM_RESOURCES", own.path());
    EXPECT_EQ(LinuxBundle().pathForResource("Mine", "plist"), own / "Mine.plist");
}

} // namespace
} // namespace kestrum
