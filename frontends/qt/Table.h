#pragma once

#include "frontends/ReusePool.h"
#include "frontends/qt/Cell.h"
#include "frontends/qt/FollowedRow.h"
#include "platform/TableView.h"

#include <QAbstractScrollArea>
#include <QLabel>
#include <QPointer>
#include <QTimer>
#include <functional>
#include <map>
#include <optional>
#include <vector>

class QHelpEvent;

namespace kestrum::qt {

/// The table. It keeps cells for the rows in view, and a few spare ones.
class Table final : public QAbstractScrollArea, public TableView {
public:
    explicit Table(TableDataSource& source);
    ~Table() override;

    void reloadData() override;
    std::shared_ptr<ReusableCell> dequeueReusableCell(std::string_view reuseIdentifier) override;
    std::unique_ptr<TableCell> makeCell(CellStyle style) override;
    void deselectRow(IndexPath indexPath, bool animated) override;
    void sizeToFit() override
    {
        _fitsRows = true;
        updateGeometry();
    }

    std::size_t rows() const { return _rows; }
    std::optional<std::size_t> current() const { return _current.row(); } ///< the row with the keyboard focus
    std::optional<std::size_t> selected() const { return _selected.row(); }
    void clearSelection();
    void makeCurrent(std::size_t row);
    /// Selects a row as a tap or Enter does.
    void select(std::size_t row);

    Cell* cellAt(std::size_t row) const;                      ///< null when it is not in view
    std::vector<Cell*> cellsInView() const;                   ///< from the top down
    std::optional<std::size_t> rowOf(const Cell& cell) const; ///< nothing when it is not in view
    QString nameOf(std::size_t row);
    /// The row's key, and its value if it has one, read from the data source now.
    QStringList textsOf(std::size_t row);
    std::size_t cells() const; ///< including those that wait for reuse

    /// Shows the current row's ring while the search field has the keyboard focus.
    void keepRing(bool kept);

    /// The text that is shown while there are no rows.
    void setHint(std::string_view text);
    const QLabel& hint() const { return _hint; }

    /// Called after a swipe from the left edge.
    void onSwipeBack(std::function<void()> action) { _swipedBack = std::move(action); }

    /// An entry of the menu that the table does not add itself.
    struct MenuEntry {
        QString text;
        std::function<void()> action;
    };
    using MenuOf = std::function<std::vector<MenuEntry>(std::optional<std::size_t> row)>;
    /// Called when the menu opens.
    void onMenu(MenuOf entries) { _menuOf = std::move(entries); }
    std::vector<MenuEntry> menuEntries(std::optional<std::size_t> row) const
    {
        return _menuOf ? _menuOf(row) : std::vector<MenuEntry>();
    }

    QSize sizeHint() const override;

protected:
    bool event(QEvent* event) override;
    bool viewportEvent(QEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void showEvent(QShowEvent* event) override;
    void scrollContentsBy(int dx, int dy) override;
    void keyPressEvent(QKeyEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void mouseDoubleClickEvent(QMouseEvent* event) override;
    void wheelEvent(QWheelEvent* event) override;
    void focusInEvent(QFocusEvent* event) override;
    void focusOutEvent(QFocusEvent* event) override;
    void contextMenuEvent(QContextMenuEvent* event) override;

private:
    enum class Drag { Undecided, Sideways, Upright, Ignored };
    struct Press {
        QPointF at;
        std::optional<std::size_t> row; ///< empty when the press stopped a scroll
        Drag drag = Drag::Undecided;
        QPointer<Strip> strip;
        std::string name; ///< of the row
    };

    int offset() const;
    int columnWidth() const;
    std::optional<std::size_t> rowAt(QPointF point) const;
    auto names()
    {
        return [this](std::size_t row) { return nameOf(row).toStdString(); };
    }
    void mark(FollowedRow& followed, std::size_t row) { followed.set(row, _rows, names()); }
    void fill(bool anew);
    void showRow(std::size_t row);
    void spare(std::size_t row, std::shared_ptr<ReusableCell> reusable);
    void place();
    void refreshLooks();
    void scrollTo(std::size_t row);
    void scrollSideways(std::size_t row, double by);
    /// False when the row already is at its place.
    bool bringBack(std::size_t row);
    void showTip(const QHelpEvent& event);
    void arrangeHint();
    bool isOnItsRow(const Press& press, QPointF point);
    void held();
    void openMenu(std::optional<std::size_t> row, QPoint at);
    void openMenuOfCurrentRow();

    TableDataSource& _source;
    std::size_t _rows = 0;
    std::map<std::size_t, std::shared_ptr<ReusableCell>> _shown; ///< by row
    ReusePool _spare;
    std::map<std::size_t, double> _sideways; ///< offsets other than 0 of rows out of view
    std::optional<std::size_t> _asked;       ///< the row whose cell the data source creates now
    FollowedRow _current, _selected;
    std::optional<Press> _press;
    std::function<void()> _swipedBack;
    MenuOf _menuOf;
    int _laidOutWidth = -1;
    bool _filling = false, _stale = true, _fitsRows = false, _ringKept = false;
    QTimer _hold; ///< runs while a finger stays on a row
    QLabel _hint;
    QWidget* _mark; ///< shows the scroll position
};

} // namespace kestrum::qt
