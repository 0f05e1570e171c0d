// The main() of tests with real widgets. It needs no display.
#include "frontends/qt/QtToolkit.h"
#include "harness/QtTestToolkit.h"

#include <gmock/gmock.h>

#include <cstdlib>

namespace {

kestrum::Toolkit* made = nullptr;

} // namespace

kestrum::Toolkit& kestrum::toolkit()
{
    return *made;
}

int main(int argc, char** argv)
{
    testing::InitGoogleMock(&argc, argv);
    // A forked copy would wait for Qt's threads, which it does not have.
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    setenv("QT_QPA_PLATFORM", "offscreen", 1);
    const auto toolkit = kestrum::makeQtToolkit();
    made = toolkit.get();
    return RUN_ALL_TESTS();
}
