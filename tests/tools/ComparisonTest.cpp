#include "harness/Places.h"
#include "harness/Scratch.h"
#include "tools/Tool.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace kestrum::tools {
namespace {

using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

std::string capture(const char* name)
{
    return inCheckout("captures/") + name + ".kcap";
}

TEST(Comparison, OfEqualFilesShowsNothing)
{
    const auto ran = run({"--compare", capture("lte"), capture("lte")});
    EXPECT_EQ(ran.status, 0);
    EXPECT_THAT(ran.output, IsEmpty());
    EXPECT_THAT(ran.remarks, IsEmpty());
}

TEST(Comparison, ShowsNumbersWithTheirDifference)
{
    const ScratchDirectory scratch;
    // The first half of the capture, up to a message's end.
    const auto whole = contentsOf(capture("lte"));
    std::size_t end = 0;
    while (end < whole.size() / 2) {
        std::size_t length = 0;
        for (std::size_t i = 4; i-- > 0;)
            length = length << 8 | static_cast<unsigned char>(whole[end + i]);
        end += 4 + length;
    }
    const auto half = scratch / "half.kcap";
    writeFile(half, whole.substr(0, end));
    const auto ran = run({"--compare", half, capture("lte")});
    EXPECT_EQ(ran.status, 1);
    EXPECT_THAT(ran.output, testing::ContainsRegex("Measured RSRP: -[0-9.]+ dBm -> -92.00 dBm \\([+-][0-9.]+ dB\\)\n"));
    EXPECT_THAT(ran.output, Not(HasSubstr("EF-ICCID")));
}

TEST(Comparison, OfTwoTechnologiesSaysSo)
{
    const auto ran = run({"--compare", capture("lte"), capture("utran")});
    EXPECT_EQ(ran.status, 1);
    EXPECT_THAT(ran.output, testing::StartsWith("technology: kVoxLogChannelTechnology_Zephra_LTE -> "
                                                "kVoxLogChannelTechnology_Zephra_UTRAN2\n"));
    EXPECT_THAT(ran.output, HasSubstr("-> (absent)\n"));
}

TEST(Comparison, WithAFileThatCannotBeReadIsAnError)
{
    const auto ran = run({"--compare", capture("lte"), "/no such file.kcap"});
    EXPECT_EQ(ran.status, 2);
    EXPECT_THAT(ran.output, IsEmpty());
    EXPECT_THAT(ran.remarks, HasSubstr("/no such file.kcap"));
}

TEST(Comparison, TakesTwoFiles)
{
    EXPECT_EQ(run({"--compare", capture("lte")}).status, 2);
    EXPECT_EQ(run({"--compare", capture("lte"), capture("lte"), capture("lte")}).status, 2);
    EXPECT_EQ(run({"--compare", "--format", "csv", capture("lte"), capture("lte")}).status, 2);
}

} // namespace
} // namespace kestrum::tools
