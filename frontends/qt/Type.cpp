#include "frontends/qt/Type.h"

#include <QFontMetricsF>
#include <QGuiApplication>

namespace kestrum::qt {

QFont fontOf(const Font& font)
{
    QFont result = QGuiApplication::font();
    if (!font.family.empty())
        result.setFamilies({QString::fromUtf8(font.family.data(), static_cast<qsizetype>(font.family.size()))});
    result.setPixelSize(qRound(font.size));
    result.setBold(font.bold);
    return result;
}

QFont semiboldFont(double size)
{
    QFont result = fontOf(systemFont(size));
    result.setWeight(QFont::DemiBold);
    return result;
}

QString lineOf(std::string_view text)
{
    QString line = QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()));
    for (QChar& each : line)
        if (each.category() == QChar::Other_Control || each == QChar::LineSeparator ||
            each == QChar::ParagraphSeparator)
            each = u' ';
    return line;
}

Size measured(const QString& line, const QFont& font)
{
    const QFontMetricsF metrics(font);
    return {metrics.horizontalAdvance(line), metrics.height()};
}

} // namespace kestrum::qt
