#include "QtTest.h"

#include "frontends/qt/Type.h"

#include <QFontInfo>
#include <QFontMetricsF>
#include <QImage>
#include <QPainter>

namespace kestrum {
namespace {

/// Where ink stands in a picture of the label, in points.
QRect inkOf(const qt::TextLabel& label)
{
    QImage picture(600, 60, QImage::Format_RGB32);
    picture.fill(Qt::white);
    {
        QPainter painter(&picture);
        label.paint(painter, {qt::lightColours(), Qt::white, 600});
    }
    QRect ink;
    for (int y = 0; y < picture.height(); ++y)
        for (int x = 0; x < picture.width(); ++x)
            if (qGray(picture.pixel(x, y)) < 128)
                ink |= QRect(x, y, 1, 1);
    return ink;
}

struct Text {
    const char* name;
    const char* text;
    Font font;
    friend void PrintTo(const Text& shown, std::ostream* out) { *out << shown.name; }
};

class Measure : public testing::TestWithParam<Text> {};

TEST_P(Measure, MatchesWhatIsDrawn)
{
    const Size size = toolkit().measure(GetParam().text, GetParam().font);
    qt::TextLabel label;
    label.setFont(GetParam().font);
    label.setText(GetParam().text);
    label.setFrame({10, 10, size.width, size.height});
    const QRect ink = inkOf(label);
    ASSERT_FALSE(ink.isEmpty());
    EXPECT_GE(ink.left(), 9);
    EXPECT_LE(ink.right(), 10 + size.width + 1);
    EXPECT_GE(ink.right(), 10 + size.width - 4) << "all of it, and no dots in place of the end";
    EXPECT_GE(ink.top(), 9);
    EXPECT_LE(ink.bottom(), 10 + size.height + 1);
}

INSTANTIATE_TEST_SUITE_P(Toolkit, Measure,
                         testing::Values(Text{"Key", "Physical Cell ID", boldSystemFont(15)},
                                         Text{"Value", "-97.25 dBm", systemFont(15)},
                                         Text{"Helvetica", "Snapshot (2026-11-16 06:05:42 +0000)", {"Helvetica", 13}},
                                         Text{"Accents", "Zürich ÄÖÜ µW", systemFont(14)}),
                         [](const auto& each) { return std::string(each.param.name); });

TEST(Measure, OfNothingIsNoWidthAndALinesHeight)
{
    const Size size = toolkit().measure("", systemFont(15));
    EXPECT_EQ(size.width, 0);
    EXPECT_EQ(size.height, toolkit().measure("Key", systemFont(15)).height);
}

TEST(Measure, TellsBoldFromRegular)
{
    EXPECT_GT(toolkit().measure("Measured RSRP", boldSystemFont(15)).width,
              toolkit().measure("Measured RSRP", systemFont(15)).width);
}

TEST(Text, StaysOnOneLine)
{
    EXPECT_EQ(qt::lineOf("a\nb\tc\r\xE2\x80\xA8"
                         "d")
                  .toStdString(),
              "a b c  d");
}

TEST(Text, SurvivesBytesThatAreNoText)
{
    EXPECT_FALSE(qt::lineOf("\xFF\xFE 1").isEmpty());
}

TEST(Digits, AreEquallyWide)
{
    const QFontMetricsF metrics(qt::fontOf(systemFont(15)));
    for (char digit = '1'; digit <= '9'; ++digit)
        EXPECT_EQ(metrics.horizontalAdvance(QLatin1Char(digit)), metrics.horizontalAdvance(u'0')) << digit;
}

TEST(Helvetica, IsLiberationSansWhereItIsInstalled)
{
    const QString family = QFontInfo(qt::fontOf({"Helvetica", 13})).family();
    EXPECT_TRUE(family == "Liberation Sans" || family == "Helvetica" || family == "Nimbus Sans" || family == "Arial")
        << family.toStdString();
}

TEST(ALabel, CutsWhatWouldPassTheEndOfItsRow)
{
    qt::TextLabel label;
    label.setFont(boldSystemFont(15));
    label.setText(std::string(300, 'M'));
    label.setFrame({10, 10, 4000, 18});
    EXPECT_LE(inkOf(label).right(), 600);
    EXPECT_GE(inkOf(label).right(), 570);
}

} // namespace
} // namespace kestrum
