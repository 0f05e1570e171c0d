#include "QtTest.h"

#include "frontends/qt/Colours.h"

#include <QImage>

#include <cmath>

namespace kestrum {
namespace {

using qt::Colours;

/// Relative luminance and contrast ratio as WCAG 2.1 defines them.
double luminance(const QColor& colour)
{
    const auto linear = [](double channel) {
        return channel <= 0.04045 ? channel / 12.92 : std::pow((channel + 0.055) / 1.055, 2.4);
    };
    return 0.2126 * linear(colour.redF()) + 0.7152 * linear(colour.greenF()) + 0.0722 * linear(colour.blueF());
}

double contrast(const QColor& a, const QColor& b)
{
    const double bright = std::max(luminance(a), luminance(b)), dark = std::min(luminance(a), luminance(b));
    return (bright + 0.05) / (dark + 0.05);
}

struct Scheme {
    const char* name;
    const Colours& (*colours)();
    friend void PrintTo(const Scheme& shown, std::ostream* out) { *out << shown.name; }
};

class AScheme : public testing::TestWithParam<Scheme> {
protected:
    const Colours& colours = GetParam().colours();
};

TEST_P(AScheme, HasTextThatCanBeRead)
{
    constexpr double kText = 4.5;
    for (const QColor& behind : {colours.surface, colours.pressed(), colours.selected(), colours.ground}) {
        EXPECT_GE(contrast(colours.ink, behind), kText) << behind.name().toStdString();
        EXPECT_GE(contrast(colours.muted, behind), kText) << behind.name().toStdString();
        EXPECT_GE(contrast(colours.accent, behind), kText) << behind.name().toStdString();
    }
    EXPECT_GE(contrast(colours.ink, colours.spread()), kText);
    EXPECT_GE(contrast(colours.danger, colours.surface), kText);
    EXPECT_GE(contrast(colours.onAccent(), colours.accent), kText);
}

TEST_P(AScheme, HasMarksThatCanBeSeen)
{
    constexpr double kMark = 3;
    for (const QColor& behind : {colours.surface, colours.pressed(), colours.selected()}) {
        EXPECT_GE(contrast(colours.muted, behind), kMark) << "chevron on " << behind.name().toStdString();
        EXPECT_GE(contrast(colours.accent, behind), kMark) << "check mark, ring on " << behind.name().toStdString();
    }
    EXPECT_GE(contrast(colours.muted, colours.ground), kMark) << "spinner";
    EXPECT_GE(contrast(colours.accent, colours.spread()), kMark) << "curve";
    EXPECT_GE(contrast(colours.muted, colours.spread()), kMark) << "where a state begins";
    EXPECT_NE(colours.pressed(), colours.surface);
    EXPECT_NE(colours.selected(), colours.surface);
}

INSTANTIATE_TEST_SUITE_P(Colours, AScheme,
                         testing::Values(Scheme{"Light", qt::lightColours}, Scheme{"Dark", qt::darkColours}),
                         [](const auto& each) { return std::string(each.param.name); });

class TheWindow : public InAWindow {
protected:
    ~TheWindow() override { QApplication::setPalette(qt::paletteOf(qt::lightColours())); }
};

TEST_F(TheWindow, FollowsTheSchemeWhileItIsShown)
{
    Rows rows = Rows::leaves(3);
    const auto screen = screenOf(rows);
    navigation().show(*screen, {"Kestrum"}, Transition::None, false);
    makeVisible();
    const auto rowGround = [&] { return table().cellAt(0)->grab().toImage().pixelColor(2, 2).name(); };
    const auto barGround = [&] { return navigation().titleBar().grab().toImage().pixelColor(2, 2).name(); };
    QApplication::setPalette(qt::paletteOf(qt::lightColours()));
    EXPECT_EQ(rowGround(), "#ffffff");
    EXPECT_EQ(barGround(), "#f4f6f8");
    QApplication::setPalette(qt::paletteOf(qt::darkColours()));
    EXPECT_TRUE(QTest::qWaitFor([&] { return rowGround() == "#171b21"; }));
    EXPECT_EQ(barGround(), "#0f1216");
}

TEST(ADesktopsPalette, TellsDarkFromLight)
{
    QPalette dark;
    dark.setColor(QPalette::Window, Qt::black);
    dark.setColor(QPalette::WindowText, Qt::white);
    EXPECT_TRUE(qt::isDark(dark));
    EXPECT_FALSE(qt::isDark(qt::paletteOf(qt::lightColours())));
}

} // namespace
} // namespace kestrum
