#include "QtTest.h"

#include "frontends/qt/Type.h"
#include "harness/Places.h"
#include "harness/Scratch.h"

#include <QFontDatabase>
#include <QFontInfo>
#include <QFontMetricsF>
#include <QImage>
#include <QPainter>
#include <QProcess>
#include <QTextLayout>

#include <filesystem>
#include <fstream>
#include <stdexcept>

namespace kestrum {
namespace {

/// The extent of the ink in a picture of the label, in points.
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

TEST(Line, KeepsOnlyWhatARowCanBeMovedTo)
{
    EXPECT_EQ(qt::lineOf("RSRP\n-97"), QStringLiteral("RSRP -97"));
    const std::string most(4 << 10, 'a');
    EXPECT_EQ(qt::lineOf(most), QString(4 << 10, u'a'));
    EXPECT_EQ(qt::lineOf(std::string(15 << 20, 'a')), QString(4 << 10, u'a') + u'\u2026');
    EXPECT_EQ(qt::lineOf(most.substr(1) + "\u6F22"), QString((4 << 10) - 1, u'a') + u'\u2026');
}

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

TEST(Measure, OfAnEmptyTextIsZeroWideAndOneLineHigh)
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

TEST(TheTestsFonts, AreTheInstalledLiberationFontsAlone)
{
    // Qt appends generic names to the list.
    for (const QString& family : QFontDatabase::families())
        EXPECT_TRUE(
            QStringList({"Liberation Mono", "Liberation Sans", "Liberation Serif", "Monospace", "Sans Serif", "Serif"})
                .contains(family))
            << family.toStdString();
}

class Row : public testing::TestWithParam<Font> {
protected:
    static double widthOf(std::string_view text) { return toolkit().measure(text, GetParam()).width; }
};

TEST_P(Row, DrawsEveryCharacterByItself)
{
    for (const char* text : {"ffff", "ffffi", "fl", "99f999ffff"}) {
        double sum = 0;
        for (const char each : std::string_view(text))
            sum += widthOf({&each, 1});
        EXPECT_DOUBLE_EQ(widthOf(text), sum) << text;
        QTextLayout layout(text, qt::fontOf(GetParam()));
        layout.beginLayout();
        layout.createLine();
        layout.endLayout();
        EXPECT_EQ(layout.glyphRuns().constFirst().glyphIndexes().size(), std::ssize(std::string_view(text))) << text;
    }
}

TEST_P(Row, HasFiguresOfOneWidth)
{
    EXPECT_EQ(widthOf("111"), widthOf("888"));
    EXPECT_EQ(widthOf("-111.71 dBm"), widthOf("-888.48 dBm"));
}

INSTANTIATE_TEST_SUITE_P(Type, Row,
                         testing::Values(systemFont(15), boldSystemFont(15), systemFont(14), Font{"Helvetica", 13},
                                         Font{"DejaVu Sans", 15}, Font{"Liberation Sans", 15}));

TEST(Helvetica, IsLiberationSansWhereItIsInstalled)
{
    EXPECT_EQ(QFontInfo(qt::fontOf({"Helvetica", 13})).family(), "Liberation Sans");
}

/// A machine's fonts: the Liberation fonts under other names.
struct Machine {
    const char* name;
    /// a file of the Liberation fonts, and its name on the machine
    std::vector<std::pair<const char*, const char*>> fonts;
    const char* desktops;          ///< the desktop's font family; null: none
    std::string window, helvetica; ///< the expected families
    friend void PrintTo(const Machine& shown, std::ostream* out) { *out << shown.name; }
};

class AMachinesWindow : public testing::TestWithParam<Machine> {
protected:
    /// The fonts that `tell-fonts` prints on that machine.
    std::string told() const
    {
        std::ofstream settings(_scratch / "fonts.conf");
        settings << "<fontconfig>";
        for (const auto& [face, family] : GetParam().fonts) {
            const std::filesystem::path folder = _scratch / family;
            std::filesystem::create_directory(folder);
            std::filesystem::create_symlink(installed(face), folder / "face.ttf");
            settings << "<dir>" << folder.string() << "</dir><match target='scan'><test name='file' compare='contains'>"
                     << "<string>/" << family << "/</string></test><edit name='family' mode='assign'><string>" << family
                     << "</string></edit></match>";
        }
        if (GetParam().desktops != nullptr)
            settings << "<match target='pattern'><edit name='family' mode='append'><string>" << GetParam().desktops
                     << "</string></edit></match>";
        settings << "<cachedir>" << _scratch / "cache"
                 << "</cachedir></fontconfig>";
        settings.close();

        auto environment = QProcessEnvironment::systemEnvironment();
        environment.insert("FONTCONFIG_FILE", QString::fromStdString(_scratch / "fonts.conf"));
        QProcess program;
        program.setProcessEnvironment(environment);
        program.start(QString::fromStdString(builtProgram("tell-fonts")), QStringList());
        EXPECT_TRUE(program.waitForFinished());
        return program.readAllStandardOutput().toStdString();
    }

private:
    static std::filesystem::path installed(const std::string& face)
    {
        for (const char* folder : {"liberation2", "liberation"})
            if (const auto path = std::filesystem::path("/usr/share/fonts/truetype") / folder / (face + ".ttf");
                exists(path))
                return path;
        throw std::runtime_error("the Liberation fonts are not installed");
    }

    ScratchDirectory _scratch;
};

TEST_P(AMachinesWindow, IsSetInASansSerif)
{
    const auto& [name, fonts, desktops, window, helvetica] = GetParam();
    EXPECT_EQ(told(), window + '\n' + window + '\n' + helvetica + '\n');
}

constexpr const char *kSans = "LiberationSans-Regular", *kSerif = "LiberationSerif-Regular",
                     *kMono = "LiberationMono-Regular";

INSTANTIATE_TEST_SUITE_P(
    On, AMachinesWindow,
    testing::Values(
        Machine{"ABareMachine",
                {{kMono, "Liberation Mono"}, {kSans, "Liberation Sans"}, {kSerif, "Liberation Serif"}},
                nullptr,
                "Liberation Sans",
                "Liberation Sans"},
        Machine{"OneWithBetterFonts",
                {{kMono, "A Mono"}, {kSans, "DejaVu Sans"}, {kSans, "Liberation Sans"}, {kSans, "Noto Sans"}},
                "A Mono",
                "Noto Sans",
                "Liberation Sans"},
        Machine{"ADesktopWithAFontOfItsOwn",
                {{kMono, "A Mono"}, {kSans, "Desktop Sans"}, {kSans, "Liberation Sans"}, {kSans, "Noto Sans"}},
                "Desktop Sans",
                "Desktop Sans",
                "Liberation Sans"},
        Machine{"ADesktopWithASerif",
                {{kSerif, "Desktop Serif"}, {kSans, "Liberation Sans"}},
                "Desktop Serif",
                "Liberation Sans",
                "Liberation Sans"},
        Machine{"ADesktopWithATypewriter",
                {{kMono, "Desktop Mono"}, {kSans, "Liberation Sans"}},
                "Desktop Mono",
                "Liberation Sans",
                "Liberation Sans"},
        Machine{"OneWithoutAnyOfTheList",
                {{kMono, "A Mono"}, {kSerif, "B Serif"}, {kSans, "C Sans"}},
                "A Mono",
                "C Sans",
                "C Sans"},
        Machine{"OneWithATypewriterAlone", {{kMono, "A Mono"}}, nullptr, "A Mono", "A Mono"}),
    [](const auto& each) { return std::string(each.param.name); });

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
