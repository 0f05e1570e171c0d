#include "frontends/qt/ContextMenu.h"

#include "frontends/qt/Copying.h"
#include "frontends/qt/Measures.h"
#include "frontends/qt/Type.h"

#include <QEvent>

namespace kestrum::qt {

ContextMenu::ContextMenu(Table& table, std::optional<std::size_t> row, QPoint at) : QMenu(&table)
{
    setAttribute(Qt::WA_DeleteOnClose);
    setFont(fontOf(systemFont(kTextSize)));
    setStyleSheet(QStringLiteral("QMenu { background: palette(base); border: 1px solid palette(mid); }"
                                 "QMenu::item { color: palette(text); min-height: %1px; padding: 0 %2px; }"
                                 "QMenu::item:selected { color: palette(base); background: palette(highlight); }")
                      .arg(kRowHeight)
                      .arg(2 * kInset));
    if (row) {
        // Read now: the row may have moved when the user chooses an action.
        const QString value = table.textsOf(*row).value(1), whole = rowAsText(table, *row);
        if (!value.isEmpty())
            addAction(QStringLiteral("Copy value"), &table, [value] { copy(value); });
        addAction(QStringLiteral("Copy row"), &table, [whole] { copy(whole); });
    }
    addAction(QStringLiteral("Copy pane as text"), &table, [&table] { copy(paneAsText(table)); });
    for (const auto& [text, action] : table.menuEntries(row))
        addAction(text, &table, action);
    table.installEventFilter(this);
    popup(at);
}

bool ContextMenu::eventFilter(QObject* watched, QEvent* event)
{
    if (watched == parent() && (event->type() == QEvent::Hide || event->type() == QEvent::EnabledChange))
        close();
    return QMenu::eventFilter(watched, event);
}

} // namespace kestrum::qt
