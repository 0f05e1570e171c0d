#include "QtTest.h"

namespace kestrum {
namespace {

struct AScreen {
    const char* name;
    qt::Display display;
    bool isHandsets;
    friend void PrintTo(const AScreen& shown, std::ostream* out) { *out << shown.name; }
};

class TheWholeScreen : public testing::TestWithParam<AScreen> {};

TEST_P(TheWholeScreen, IsTakenOnAHandsetAlone)
{
    EXPECT_EQ(qt::isHandset(GetParam().display), GetParam().isHandsets);
}

INSTANTIATE_TEST_SUITE_P(
    MainWindow, TheWholeScreen,
    testing::Values(AScreen{"Handset", {{360, 720}, {68, 136}, true, false}, true},
                    AScreen{"HandsetOnItsSide", {{720, 360}, {136, 68}, true, false}, true},
                    AScreen{"LaptopAtDoubleScale", {{640, 400}, {286, 179}, false, false}, false},
                    AScreen{"TouchedLaptopAtDoubleScale", {{640, 400}, {286, 179}, true, false}, false},
                    AScreen{"Desktop", {{1280, 800}, {338, 212}, false, false}, false},
                    AScreen{"TouchedAndSmallOfUnknownSize", {{360, 720}, {0, 0}, true, false}, true},
                    AScreen{"TouchedAndLargeOfUnknownSize", {{1280, 800}, {0, 0}, true, false}, false},
                    AScreen{"UntouchedAndSmallOfUnknownSize", {{640, 400}, {0, 0}, false, false}, false},
                    AScreen{"TelevisionThatGivesItsAspectRatio", {{1920, 1080}, {160, 90}, false, false}, false},
                    AScreen{"BareScreen", {{1280, 800}, {338, 212}, false, true}, true}),
    [](const auto& each) { return std::string(each.param.name); });

} // namespace
} // namespace kestrum
