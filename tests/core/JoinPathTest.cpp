#include "core/KestrumModelNode.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

struct Case {
    const char* name;
    const char* path;
    const char* child;
    const char* joined;

    friend void PrintTo(const Case& shown, std::ostream* out) { *out << shown.name; }
};

class JoinPath : public testing::TestWithParam<Case> {};

TEST_P(JoinPath, Gives)
{
    EXPECT_EQ(joinPath(GetParam().path, GetParam().child), GetParam().joined);
}

INSTANTIATE_TEST_SUITE_P(
    Names, JoinPath,
    testing::Values(Case{"BelowTheRoot", "/", "Serving Cell", "/Serving Cell"},
                    Case{"BelowAChild", "/Serving Cell", "RSSI", "/Serving Cell/RSSI"},
                    Case{"SlashInsideStays", "/Cells", "RSCP/EcNo", "/Cells/RSCP/EcNo"},
                    Case{"SlashesInsideStay", "/Cells", "a//b", "/Cells/a//b"},
                    Case{"LeadingSlashGoes", "/", "/a", "/a"}, Case{"TrailingSlashesGo", "/a", "b//", "/a/b"},
                    Case{"SlashesAtBothEndsGo", "/a", "//b/c/", "/a/b/c"}, Case{"EmptyName", "/", "", "/(empty)"},
                    Case{"EmptyNameBelowAChild", "/a", "", "/a/(empty)"}, Case{"OneSlash", "/", "/", "/(empty)"},
                    Case{"SlashesOnly", "/a", "///", "/a/(empty)"}, Case{"BlankIsAName", "/a", " ", "/a/ "},
                    Case{"EmptyPathCountsAsTheRoot", "", "a", "/a"}),
    [](const auto& each) { return std::string(each.param.name); });

} // namespace
} // namespace kestrum
