#include "frontends/qt/Accessibility.h"

#include "frontends/qt/Alert.h"
#include "frontends/qt/FocusRing.h"
#include "frontends/qt/MainWindow.h"
#include "frontends/qt/PlotView.h"
#include "frontends/qt/Table.h"
#include "frontends/qt/Type.h"

#include <QAccessible>
#include <QAccessibleWidget>
#include <QScrollBar>
#include <algorithm>

namespace kestrum::qt {

namespace {

Table* tableOf(const Cell& cell)
{
    QWidget* viewport = cell.parentWidget();
    return viewport ? dynamic_cast<Table*>(viewport->parentWidget()) : nullptr;
}

/// A plot is its sentence. No event tells of a new one: it is new at every refresh.
class AccessiblePlot final : public QAccessibleWidget {
public:
    explicit AccessiblePlot(Plot& plot) : QAccessibleWidget(&plot, QAccessible::Chart) {}

    QString text(QAccessible::Text kind) const override
    {
        return kind == QAccessible::Name ? lineOf(static_cast<Plot*>(widget())->plot().sentence)
                                         : QAccessibleWidget::text(kind);
    }
};

class AccessibleCell final : public QAccessibleWidget {
public:
    explicit AccessibleCell(Cell& cell) : QAccessibleWidget(&cell, QAccessible::ListItem) {}

    QAccessibleInterface* parent() const override { return QAccessible::queryAccessibleInterface(tableOf(cell())); }

    QString text(QAccessible::Text kind) const override
    {
        return kind == QAccessible::Name ? cell().spoken() : QAccessibleWidget::text(kind);
    }

    QAccessible::State state() const override
    {
        QAccessible::State state = QAccessibleWidget::state();
        state.focusable = state.selectable = !state.disabled;
        if (const auto [table, row] = place(); table) {
            state.focused = table->hasFocus() && table->current() == row;
            state.selected = table->selected() == row;
        }
        state.checkable = state.checked = cell().accessory() == Accessory::CheckMark;
        state.hasPopup = false;
        state.expandable = cell().accessory() == Accessory::DisclosureIndicator;
        return state;
    }

    QStringList actionNames() const override { return {pressAction(), setFocusAction()}; }

    void doAction(const QString& name) override
    {
        const auto [table, row] = place();
        // Assistive technology may keep references to covered rows, or to rows of a pane that was removed.
        if (!table || !table->isVisible() || !table->isEnabled())
            return;
        FocusRing::instance().setShown(true);
        table->makeCurrent(row);
        if (name == pressAction())
            table->select(row);
        else
            table->setFocus();
    }

private:
    struct Place {
        Table* table;
        std::size_t row;
    };

    Cell& cell() const { return *static_cast<Cell*>(widget()); }

    Place place() const
    {
        if (Table* table = tableOf(cell()))
            if (const auto row = table->rowOf(cell()))
                return {table, *row};
        return {nullptr, 0};
    }
};

/// Its children are the rows in view, from the top down.
class AccessibleTable final : public QAccessibleWidget {
public:
    explicit AccessibleTable(Table& table) : QAccessibleWidget(&table, QAccessible::List) {}

    int childCount() const override { return static_cast<int>(table().cellsInView().size()); }

    QAccessibleInterface* child(int index) const override
    {
        const auto cells = table().cellsInView();
        return index < 0 || index >= static_cast<int>(cells.size())
                   ? nullptr
                   : QAccessible::queryAccessibleInterface(cells[static_cast<std::size_t>(index)]);
    }

    int indexOfChild(const QAccessibleInterface* child) const override
    {
        const auto cells = table().cellsInView();
        const auto found = std::find(cells.begin(), cells.end(), child->object());
        return found == cells.end() ? -1 : static_cast<int>(found - cells.begin());
    }

    QAccessibleInterface* focusChild() const override
    {
        const auto row = table().current();
        return row ? QAccessible::queryAccessibleInterface(table().cellAt(*row)) : nullptr;
    }

    QAccessibleInterface* childAt(int x, int y) const override
    {
        for (Cell* cell : table().cellsInView())
            if (cell->rect().contains(cell->mapFromGlobal(QPoint(x, y))))
                return QAccessible::queryAccessibleInterface(cell);
        return nullptr;
    }

private:
    Table& table() const { return *static_cast<Table*>(widget()); }
};

/// A widget that holds others. Hidden widgets are not its children.
class AccessibleGroup final : public QAccessibleWidget {
public:
    using QAccessibleWidget::QAccessibleWidget;

    int childCount() const override { return static_cast<int>(shown().size()); }

    QAccessibleInterface* child(int index) const override
    {
        return QAccessible::queryAccessibleInterface(shown().value(index));
    }

    int indexOfChild(const QAccessibleInterface* child) const override
    {
        return static_cast<int>(shown().indexOf(qobject_cast<QWidget*>(child->object())));
    }

    QAccessibleInterface* childAt(int x, int y) const override
    {
        const auto children = shown();
        for (auto each = children.rbegin(); each != children.rend(); ++each) // the topmost child is the last one
            if ((*each)->rect().contains((*each)->mapFromGlobal(QPoint(x, y))))
                return QAccessible::queryAccessibleInterface(*each);
        return nullptr;
    }

    // A focus action would take the focus from the widgets inside.
    QStringList actionNames() const override { return {}; }
    void doAction(const QString&) override {}

    QAccessible::State state() const override
    {
        QAccessible::State state = QAccessibleWidget::state();
        state.modal = role() == QAccessible::Dialog;
        return state;
    }

private:
    QWidgetList shown() const
    {
        QWidgetList shown = widget()->findChildren<QWidget*>(Qt::FindDirectChildrenOnly);
        shown.removeIf([](const QWidget* each) { return each->isHidden() || each->isWindow(); });
        return shown;
    }
};

QAccessible::Role roleOf(const QWidget& group)
{
    if (dynamic_cast<const MainWindow*>(&group))
        return QAccessible::Window;
    if (dynamic_cast<const SaveSheet*>(&group) || dynamic_cast<const Alert*>(&group))
        return QAccessible::Dialog;
    return QAccessible::Client;
}

QAccessibleInterface* makeInterface(const QString& type, QObject* object)
{
    if (auto* cell = dynamic_cast<Cell*>(object))
        return new AccessibleCell(*cell);
    if (auto* plot = dynamic_cast<Plot*>(object))
        return new AccessiblePlot(*plot);
    if (auto* table = dynamic_cast<Table*>(object))
        return new AccessibleTable(*table);
    // The table scrolls to the row that is requested. Its scroll bars are never shown and must not be moved from
    // outside.
    if (auto* bar = qobject_cast<QScrollBar*>(object))
        return new QAccessibleWidget(bar, QAccessible::ScrollBar);
    if (auto* group = qobject_cast<QWidget*>(object); group && type == QStringLiteral("QWidget"))
        return new AccessibleGroup(group, roleOf(*group));
    return nullptr;
}

} // namespace

void installAccessibility()
{
    QAccessible::installFactory(makeInterface);
}

} // namespace kestrum::qt
