#pragma once

#include "frontends/qt/Table.h"
#include "frontends/qt/Toolbar.h"

#include <QLineEdit>

namespace kestrum::qt {

/// A bar in the toolbar's place: jumps to a row while the user types a part of its name.
class Jump final : public QWidget {
    Q_OBJECT

public:
    explicit Jump(QWidget* parent);

    void start(Table& table);
    /// Jumps to the next row that matches the last search.
    void again(Table& table);
    /// Closes the bar. The table stays at the row that was found.
    void end();

    QLineEdit& field() { return _field; }
    bool hasFound() const { return _missing.isHidden(); }

    bool eventFilter(QObject* watched, QEvent* event) override;

Q_SIGNALS:
    void ended();

protected:
    void paintEvent(QPaintEvent*) override;
    void resizeEvent(QResizeEvent*) override;

private:
    void follow();
    void giveUp();
    static bool go(Table& table, const QString& name, std::size_t from);

    QLineEdit _field;
    LineLabel _missing;
    QPointer<Table> _table;
    std::size_t _from = 0;
    QString _last;
};

} // namespace kestrum::qt
