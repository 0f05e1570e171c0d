#include "EndToEnd.h"
#include "frontends/qt/QtToolkit.h"

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
    setenv("QT_QPA_PLATFORM", "offscreen", 1); // real widgets, on a screen that nobody needs to have
    const auto toolkit = kestrum::makeQtToolkit();
    made = toolkit.get();
    return RUN_ALL_TESTS();
}
