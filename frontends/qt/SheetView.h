#pragma once

#include "frontends/qt/Button.h"
#include "frontends/qt/PlotView.h"
#include "platform/NavigationView.h"
#include "platform/Sheet.h"

#include <QAbstractSlider>
#include <QLabel>
#include <QPointer>
#include <QScrollArea>
#include <QTableWidget>
#include <QVBoxLayout>

#include <memory>
#include <vector>

namespace kestrum::qt {

/// The command of a key; null for another key.
const SheetCommand* sheetCommandOf(const QKeyEvent& event);

/// The value of a level as a thin line, on the scale of its key.
class LevelBar final : public QWidget {
public:
    explicit LevelBar(QWidget* parent);
    void setPart(double part);
    QSize sizeHint() const override;

protected:
    void paintEvent(QPaintEvent*) override;

private:
    double _part = 0;
};

/// A table of a sheet: Qt's, so that a screen reader has its rows, columns and headings.
class SheetTableView final : public QTableWidget {
public:
    /// `around` scrolls up and down what is higher than the screen.
    SheetTableView(QAbstractScrollArea& around, QWidget* parent);
    /// Changes only what differs, so that nothing moves under the eye.
    void setTable(const SheetTable& table);
    /// As high as its rows, without scrolling.
    void fitRows();

    /// Covers the columns that left the view, where they identify a row. Drawn: a screen reader has them once.
    const QWidget& frozen() const { return *_frozen; }
    void drawFrozen(QPainter& painter);
    void pressFrozen(QPoint at);

protected:
    void resizeEvent(QResizeEvent* event) override;
    void scrollContentsBy(int dx, int dy) override;

private:
    void setHeadings(const SheetTable& table);
    void setRow(int row, const SheetTable& table, const SheetRow& shown);
    void insertAtFront(std::size_t rows);
    /// Columns never become narrower: the others would move.
    void widen(int column, int width);
    void arrangeFrozen();
    int identityColumns() const;

    SheetTable _table;
    QWidget* _frozen;
};

/// A part of a sheet: caption, lines of text, facts, levels, plot, table, note.
class SheetPartView final : public QWidget {
public:
    SheetPartView(const PlotActions& actions, QAbstractScrollArea& around, QWidget* parent);
    /// `alone`: the table has the rest of the sheet, and scrolls.
    void setPart(const SheetPart& part, bool alone);
    SheetTableView& table() { return _table; }
    PlotView& plot() { return _plot; }
    const QLabel& lines() const { return _lines; }
    const QLabel& facts() const { return _facts; }

private:
    struct Level {
        QLabel* name;
        QLabel* value;
        LevelBar* bar;
        QLabel* word;
    };

    void setLevels(const SheetPart& part);

    QLabel _caption, _lines, _facts, _note;
    QWidget _levels;
    std::vector<Level> _shownLevels;
    PlotView _plot;
    SheetTableView _table;
};

/// A sheet over the panes: a bar with a button back, its parts, and its status.
class SheetView final : public QWidget {
public:
    SheetView(SheetOwner& owner, QWidget* parent);
    void setContents(const SheetContents& contents);

    Button& back() { return _back; }
    QString title() const { return _title.text(); }
    QString status() const { return _status.text(); }
    const std::vector<SheetPartView*>& parts() const { return _parts; }
    PlotView* plot(); ///< null where the sheet has none
    /// No call to the owner after this.
    void end() { _owner = nullptr; }

protected:
    void keyPressEvent(QKeyEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void paintEvent(QPaintEvent*) override;

private:
    PlotActions plotActions();
    void leave();
    void scroll(QAbstractSlider::SliderAction action);

    SheetOwner* _owner;
    bool _canSort = false;
    QVBoxLayout _layout;
    Button _back;
    QLabel _title, _status;
    QScrollArea _scroll;
    QWidget _inside;
    QVBoxLayout _insideLayout;
    QLabel _hint;  // inside, so destroyed before it
    QWidget _rest; ///< the room under the parts
    std::vector<SheetPartView*> _parts;
};

} // namespace kestrum::qt
