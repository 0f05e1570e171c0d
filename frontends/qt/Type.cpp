#include "frontends/qt/Type.h"

#include <QApplication>
#include <QFontDatabase>
#include <QFontInfo>
#include <QFontMetricsF>
#include <QRawFont>
#include <algorithm>
#include <cstddef>

namespace kestrum::qt {

namespace {

constexpr double kLeastSpacing = 1.0 / 64;
const QString kLiberationSans = QStringLiteral("Liberation Sans");

// Bytes. A value can have megabytes. Users do not scroll a row further than this, and every draw measures the text.
constexpr std::size_t kMostShown = 4 << 10;

/// Whether the font resolves to a proportional face without serifs.
bool isSansSerif(const QFont& font)
{
    if (QFontInfo(font).fixedPitch())
        return false;
    // The PANOSE field of the OpenType table OS/2: the serif styles 2 to 10 of Latin text (2) have serifs. A font
    // that gives no value counts as sans serif.
    constexpr qsizetype kFamilyType = 32, kSerifStyle = 33;
    const QByteArray table = QRawFont::fromFont(font).fontTable("OS/2");
    return table.size() <= kSerifStyle || table[kFamilyType] != 2 || table[kSerifStyle] < 2 || table[kSerifStyle] > 10;
}

} // namespace

void chooseSansSerif()
{
    if (isSansSerif(QGuiApplication::font()))
        return;
    for (const QString& each :
         QStringList{QStringLiteral("Noto Sans"), QStringLiteral("DejaVu Sans"), kLiberationSans} +
             QFontDatabase::families()) {
        QFont font = QGuiApplication::font();
        font.setFamilies({each});
        if (QFontDatabase::hasFamily(each) && isSansSerif(font)) {
            QApplication::setFont(font);
            return;
        }
    }
}

QFont fontOf(const Font& font)
{
    QFont result = QGuiApplication::font();
    if (!font.family.empty()) {
        QStringList families{QString::fromUtf8(font.family.data(), static_cast<qsizetype>(font.family.size())),
                             QFontInfo(result).family()};
        if (font.family == "Helvetica")
            families.prepend(kLiberationSans); // as wide on every machine, whatever replaces Helvetica there
        result.setFamilies(families);
    }
    result.setPixelSize(qRound(font.size));
    result.setBold(font.bold);
    // Digits must keep their positions when a value changes: all have one width, and "99f999ffff" has no ligature. A
    // letter spacing of 1/64 point, the smallest value, turns ligatures off in every Qt version.
    result.setKerning(false);
    result.setLetterSpacing(QFont::AbsoluteSpacing, kLeastSpacing);
#if QT_VERSION >= QT_VERSION_CHECK(6, 7, 0)
    result.setFeature("tnum", 1);
#endif
    return result;
}

QFont semiboldFont(double size)
{
    QFont result = fontOf(systemFont(size));
    result.setWeight(QFont::DemiBold);
    result.setKerning(true);
    return result;
}

QString lineOf(std::string_view text)
{
    std::size_t shown = std::min(text.size(), kMostShown);
    while (shown > 0 && shown < text.size() && (static_cast<unsigned char>(text[shown]) & 0xC0) == 0x80)
        --shown; // not inside a UTF-8 character
    QString line = QString::fromUtf8(text.data(), static_cast<qsizetype>(shown));
    for (QChar& each : line)
        if (each.category() == QChar::Other_Control || each == QChar::LineSeparator ||
            each == QChar::ParagraphSeparator)
            each = u' ';
    return shown < text.size() ? line + u'\u2026' : line;
}

Size measured(const QString& line, const QFont& font)
{
    const QFontMetricsF metrics(font);
    return {metrics.horizontalAdvance(line), metrics.height()};
}

} // namespace kestrum::qt
