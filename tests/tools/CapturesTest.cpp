#include "Tool.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>

namespace kestrum::tools {
namespace {

std::vector<std::string> captures()
{
    std::vector<std::string> names;
    for (const auto& file : std::filesystem::directory_iterator(inCheckout("captures")))
        if (file.path().extension() == ".kcap")
            names.push_back(file.path().stem().string());
    std::ranges::sort(names);
    return names;
}

class Capture : public testing::TestWithParam<std::string> {
protected:
    const std::string stem = inCheckout("captures/" + GetParam());
};

TEST_P(Capture, GivesTheTreeBesideIt)
{
    const auto ran = run({stem + ".kcap"});
    EXPECT_EQ(ran.output, contentsOf(stem + ".tree"));
    EXPECT_EQ(ran.remarks, "");
    EXPECT_EQ(ran.status, 0);
}

TEST_P(Capture, GivesTheJsonBesideIt)
{
    EXPECT_EQ(run({"--format", "json", stem + ".kcap"}).output, contentsOf(stem + ".json"));
}

TEST_P(Capture, IsSmall)
{
    EXPECT_LE(std::filesystem::file_size(stem + ".kcap"), 150u << 10);
}

INSTANTIATE_TEST_SUITE_P(Captures, Capture, testing::ValuesIn(captures()), [](const auto& each) { return each.param; });

TEST(Captures, AreThereForEveryTechnology)
{
    EXPECT_EQ(captures(), (std::vector<std::string>{"cdma", "gsm", "ifx", "lte", "utran"}));
}

} // namespace
} // namespace kestrum::tools
