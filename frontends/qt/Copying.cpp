#include "frontends/qt/Copying.h"

#include "frontends/qt/Table.h"

#include <QClipboard>
#include <QGuiApplication>

namespace kestrum::qt {

QString rowAsText(Table& table, std::size_t row)
{
    QStringList texts = table.textsOf(row);
    texts.removeAll(QString());
    return texts.join(u'\t');
}

QString paneAsText(Table& table)
{
    QString lines;
    for (std::size_t row = 0; row < table.rows(); ++row)
        lines += rowAsText(table, row) + u'\n';
    return lines;
}

void copy(const QString& text)
{
    QGuiApplication::clipboard()->setText(text);
}

} // namespace kestrum::qt
