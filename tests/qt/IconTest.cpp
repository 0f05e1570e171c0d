#include "frontends/qt/Icon.h"
#include "QtTest.h"
#include "harness/Scratch.h"

#include <fstream>

namespace kestrum {
namespace {

using qt::drawnIcon;
using qt::paintedIcon;
using qt::windowIcon;

QImage pictureOf(const QIcon& icon, int size)
{
    return icon.pixmap(size).toImage().convertToFormat(QImage::Format_ARGB32);
}

/// The average difference of two pictures per pixel and channel, of 255.
double difference(const QImage& one, const QImage& other)
{
    double sum = 0;
    for (int y = 0; y < one.height(); ++y)
        for (int x = 0; x < one.width(); ++x) {
            const QRgb a = one.pixel(x, y), b = other.pixel(x, y);
            sum += std::abs(qRed(a) - qRed(b)) + std::abs(qGreen(a) - qGreen(b)) + std::abs(qBlue(a) - qBlue(b)) +
                   std::abs(qAlpha(a) - qAlpha(b));
        }
    return sum / (4.0 * one.width() * one.height());
}

/// The features by which people recognise the icon: its blue ground, and white strokes on it.
void expectTheKestrel(const QIcon& icon)
{
    const QImage picture = pictureOf(icon, 16);
    ASSERT_EQ(picture.size(), QSize(16, 16));
    int blue = 0, white = 0;
    for (int y = 0; y < 16; ++y)
        for (int x = 0; x < 16; ++x) {
            const QRgb pixel = picture.pixel(x, y);
            blue += qAlpha(pixel) > 200 && qBlue(pixel) > qRed(pixel) + 80;
            white += qAlpha(pixel) > 200 && qRed(pixel) > 200;
        }
    EXPECT_GT(blue, 16 * 16 / 4);
    EXPECT_GT(white, 16 * 16 / 16);
}

class TheIcon : public InAWindow {
protected:
    /// Icons of a desktop with its own themes, in place of this machine's.
    TheIcon() : _pathsBefore(QIcon::themeSearchPaths()), _nameBefore(QIcon::themeName())
    {
        QIcon::setThemeSearchPaths({QString::fromStdString(themes.path())});
        QIcon::setThemeName(QStringLiteral("hicolor"));
    }
    ~TheIcon() override
    {
        QIcon::setThemeSearchPaths(_pathsBefore);
        QIcon::setThemeName(_nameBefore);
    }

    ScratchDirectory themes;

private:
    QStringList _pathsBefore;
    QString _nameBefore;
};

TEST_F(TheIcon, IsOnTheWindowSoonAfterItsFirstPicture)
{
    EXPECT_TRUE(window().windowIcon().isNull()); // the search for it must not hold up the picture
    makeVisible();
    ASSERT_TRUE(QTest::qWaitFor([&] { return !window().windowIcon().isNull(); }));
    expectTheKestrel(window().windowIcon());
    EXPECT_EQ(QGuiApplication::desktopFileName(), "kestrum");
}

TEST_F(TheIcon, ComesFromTheProgramWhereNoThemeHasIt)
{
    expectTheKestrel(windowIcon());
}

TEST_F(TheIcon, ComesFromTheThemeThatHasIt)
{
    std::filesystem::create_directories(themes / "hicolor/16x16/apps");
    std::ofstream(themes / "hicolor/index.theme") << "[Icon Theme]\nName=Hicolor\nDirectories=16x16/apps\n"
                                                     "[16x16/apps]\nSize=16\n";
    QImage green(16, 16, QImage::Format_ARGB32);
    green.fill(Qt::green);
    ASSERT_TRUE(green.save(QString::fromStdString(themes / "hicolor/16x16/apps/kestrum.png")));
    EXPECT_EQ(pictureOf(windowIcon(), 16).pixelColor(8, 8), QColor(Qt::green));
}

/// Finds an icon that was changed in only one of its forms.
class PaintedIcon : public testing::TestWithParam<int> {};

TEST_P(PaintedIcon, LooksLikeTheDrawing)
{
    const int size = GetParam();
    const QImage painted = pictureOf(paintedIcon(), size);
    ASSERT_EQ(painted.size(), QSize(size, size));
    // Without Qt's SVG plug-in only the pictures are available.
    const QImage drawn = pictureOf(drawnIcon().isNull() ? windowIcon() : drawnIcon(), size);
    ASSERT_EQ(drawn.size(), painted.size());
    EXPECT_LT(difference(drawn, painted), 4) << "resources/icons/rewrite paints them again";
}

INSTANTIATE_TEST_SUITE_P(InEachSize, PaintedIcon, testing::Values(16, 22, 24, 32, 48, 64, 128, 256));

TEST(PaintedIconAlone, ServesAtTheSizeOfAWindowsTitle)
{
    expectTheKestrel(paintedIcon());
}

} // namespace
} // namespace kestrum
