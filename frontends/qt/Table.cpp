#include "frontends/qt/Table.h"

#include "frontends/qt/ContextMenu.h"
#include "frontends/qt/Copying.h"
#include "frontends/qt/Drag.h"
#include "frontends/qt/FocusRing.h"
#include "frontends/qt/Measures.h"
#include "frontends/qt/Paint.h"
#include "frontends/qt/Type.h"

#include <QAccessible>
#include <QApplication>
#include <QContextMenuEvent>
#include <QHelpEvent>
#include <QKeyEvent>
#include <QMouseEvent>
#include <QScrollBar>
#include <QStyleHints>
#include <QToolTip>
#include <algorithm>
#include <cmath>

namespace kestrum::qt {

namespace {

constexpr int kSidewaysStep = 60; // points by which an arrow key moves a strip
constexpr double kEdge = 24;      // points; a swipe back begins within this distance from the left edge
constexpr double kSwipe = 60;     // points; the minimum length of a swipe back

/// The table's `makeCell` creates every cell, so the cast is safe.
Cell& cellOf(ReusableCell& reusable)
{
    return static_cast<Cell&>(reusable.cell());
}

/// A thin line at the right edge. Its length is the share of the rows in view.
class ScrollMark final : public QWidget {
public:
    explicit ScrollMark(const QScrollBar& bar, QWidget* parent) : QWidget(parent), _bar(bar)
    {
        setAttribute(Qt::WA_TransparentForMouseEvents);
    }

protected:
    void paintEvent(QPaintEvent*) override
    {
        const double whole = _bar.maximum() + _bar.pageStep();
        if (_bar.maximum() == 0)
            return;
        const double length = std::max(24.0, height() * _bar.pageStep() / whole);
        const double top = (height() - length) * _bar.value() / _bar.maximum();
        QPainter painter(this);
        painter.setRenderHint(QPainter::Antialiasing);
        painter.setPen(Qt::NoPen);
        painter.setBrush(coloursOf(*this).muted);
        painter.drawRoundedRect(QRectF(0, top, width(), length), width() / 2.0, width() / 2.0);
    }

private:
    const QScrollBar& _bar;
};

} // namespace

Table::Table(TableDataSource& source) : _source(source), _hint(viewport())
{
    _hint.setFont(fontOf(systemFont(kTextSize)));
    _hint.setForegroundRole(QPalette::PlaceholderText);
    _hint.setTextFormat(Qt::PlainText);
    _hint.setAlignment(Qt::AlignCenter);
    _hint.setWordWrap(true);
    _hint.setAttribute(Qt::WA_TransparentForMouseEvents);
    _hint.hide();
    setFrameShape(QFrame::NoFrame);
    setFocusPolicy(Qt::StrongFocus);
    setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    setVerticalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    viewport()->setBackgroundRole(QPalette::Base);
    viewport()->setAutoFillBackground(true);
    _mark = new ScrollMark(*verticalScrollBar(), viewport());

    setUpScroller(*this); // the table itself distinguishes drags from taps
    _hold.setSingleShot(true);
    connect(&_hold, &QTimer::timeout, this, [this] { held(); });
    connect(&FocusRing::instance(), &FocusRing::changed, this, [this] { refreshLooks(); });
}

Table::~Table()
{
    // The viewport does not own the cells; the holders of their shared pointers do.
    for (QWidget* child : viewport()->findChildren<QWidget*>(Qt::FindDirectChildrenOnly))
        if (dynamic_cast<Cell*>(child))
            child->setParent(nullptr);
}

void Table::reloadData()
{
    // A hidden table reloads when it is shown.
    _stale = true;
    if (isVisible())
        fill(true);
    if (_fitsRows)
        updateGeometry();
}

std::shared_ptr<ReusableCell> Table::dequeueReusableCell(std::string_view reuseIdentifier)
{
    auto reusable = _asked ? _spare.take(*_asked, reuseIdentifier) : nullptr;
    if (reusable)
        cellOf(*reusable).resize(columnWidth(), kRowHeight);
    return reusable;
}

std::unique_ptr<TableCell> Table::makeCell(CellStyle style)
{
    auto cell = std::make_unique<Cell>(style);
    cell->setParent(viewport());
    cell->resize(columnWidth(), kRowHeight);
    return cell;
}

void Table::deselectRow(IndexPath indexPath, bool)
{
    if (selected() == indexPath.row)
        clearSelection();
}

void Table::clearSelection()
{
    _selected.clear();
    refreshLooks();
}

void Table::setHint(std::string_view text)
{
    _hint.setText(QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size())));
    arrangeHint();
}

void Table::arrangeHint()
{
    const bool shown = _rows == 0 && !_hint.text().isEmpty();
    const int x = (viewport()->width() - columnWidth()) / 2;
    // A little above the middle: the eye looks there on an empty page.
    _hint.setGeometry(x + 2 * kInset, 0, columnWidth() - 4 * kInset, viewport()->height() * 4 / 5);
    _hint.setVisible(shown);
    setAccessibleDescription(shown ? _hint.text() : QString());
}

QSize Table::sizeHint() const
{
    const int rows = _fitsRows ? static_cast<int>(_source.numberOfRowsInSection(const_cast<Table&>(*this), 0)) : 3;
    return {kPhoneWidth, rows * kRowHeight};
}

// Rows and cells ------------------------------------------------------------------------------------------------

int Table::offset() const
{
    return verticalScrollBar()->value();
}
int Table::columnWidth() const
{
    return std::min(viewport()->width(), kColumn);
}

void Table::fill(bool anew)
{
    if (_filling)
        return;
    _filling = true;
    if (anew) {
        _stale = false;
        _rows = _source.numberOfRowsInSection(*this, 0);
        _laidOutWidth = columnWidth();
    }
    const int height = viewport()->height();
    const int whole = static_cast<int>(std::min<std::size_t>(_rows, 40'000'000)) * kRowHeight;
    verticalScrollBar()->setPageStep(height);
    verticalScrollBar()->setSingleStep(kRowHeight);
    verticalScrollBar()->setRange(0, std::max(0, whole - height));

    const auto first = static_cast<std::size_t>(offset() / kRowHeight);
    const auto end = std::min(_rows, static_cast<std::size_t>((offset() + height + kRowHeight - 1) / kRowHeight));
    std::vector<QPointer<Cell>> left;
    for (auto each = _shown.begin(); each != _shown.end();)
        if (anew || each->first < first || each->first >= end) {
            left.emplace_back(&cellOf(*each->second));
            spare(each->first, std::move(each->second));
            each = _shown.erase(each);
        } else {
            ++each;
        }
    for (std::size_t row = first; row < end; ++row)
        if (!_shown.contains(row))
            showRow(row);
    if (anew) {
        _current.follow(_rows, names());
        _selected.follow(_rows, names());
    }
    // Hidden last: a cell that shows a row again must not be hidden in between.
    for (const auto& cell : left)
        if (cell && !rowOf(*cell))
            cell->hide();
    _filling = false;
    place();
    refreshLooks();
}

void Table::spare(std::size_t row, std::shared_ptr<ReusableCell> reusable)
{
    if (const double offset = cellOf(*reusable).sideways(); offset > 0)
        _sideways[row] = offset;
    else
        _sideways.erase(row);
    _spare.put(row, std::move(reusable));
}

void Table::showRow(std::size_t row)
{
    _asked = row;
    auto reusable = _source.cellForRowAtIndexPath(*this, {0, row});
    _asked.reset();
    Cell& cell = cellOf(*reusable);
    const auto sideways = _sideways.find(row);
    cell.layoutSubviews();
    cell.setRow(row);
    cell.setSideways(sideways == _sideways.end() ? 0 : sideways->second);
    _shown.emplace(row, std::move(reusable));
}

void Table::place()
{
    const int x = (viewport()->width() - columnWidth()) / 2;
    for (const auto& [row, reusable] : _shown) {
        Cell& cell = cellOf(*reusable);
        cell.setGeometry(x, static_cast<int>(row) * kRowHeight - offset(), columnWidth(), kRowHeight);
        cell.show();
    }
    _mark->setGeometry(viewport()->width() - 3, 2, 2, viewport()->height() - 4);
    _mark->raise();
    _mark->update();
    arrangeHint();
}

void Table::refreshLooks()
{
    const bool ringed = FocusRing::instance().isShown() && (hasFocus() || _ringKept);
    for (const auto& [row, reusable] : _shown)
        cellOf(*reusable).setLook({.pressed = _press && _press->row == row && _press->drag == Drag::Undecided,
                                   .selected = selected() == row,
                                   .ringed = ringed && current() == row});
}

Cell* Table::cellAt(std::size_t row) const
{
    const auto found = _shown.find(row);
    return found == _shown.end() ? nullptr : &cellOf(*found->second);
}

std::vector<Cell*> Table::cellsInView() const
{
    std::vector<Cell*> cells;
    cells.reserve(_shown.size());
    for (const auto& [row, reusable] : _shown)
        cells.push_back(&cellOf(*reusable));
    return cells;
}

QString Table::nameOf(std::size_t row)
{
    const Cell* cell = cellAt(row);
    return cell ? cell->name() : textsOf(row).value(0);
}

QStringList Table::textsOf(std::size_t row)
{
    // Outside `showRow` no cell is offered for reuse. So this is a new cell, of the row's kind.
    const auto reusable = _source.cellForRowAtIndexPath(*this, {0, row});
    return cellOf(*reusable).texts();
}

std::size_t Table::cells() const
{
    const auto children = viewport()->findChildren<QWidget*>(Qt::FindDirectChildrenOnly);
    return static_cast<std::size_t>(
        std::count_if(children.begin(), children.end(), [](QWidget* each) { return dynamic_cast<Cell*>(each); }));
}

std::optional<std::size_t> Table::rowOf(const Cell& cell) const
{
    const auto found = _shown.find(cell.row());
    return found != _shown.end() && &cellOf(*found->second) == &cell ? std::optional(cell.row()) : std::nullopt;
}

std::optional<std::size_t> Table::rowAt(QPointF point) const
{
    const double y = point.y() + offset();
    const double x = point.x() - (viewport()->width() - columnWidth()) / 2.0;
    if (y < 0 || x < 0 || x >= columnWidth() || y >= static_cast<double>(_rows) * kRowHeight)
        return std::nullopt;
    return static_cast<std::size_t>(y / kRowHeight);
}

void Table::resizeEvent(QResizeEvent* event)
{
    QAbstractScrollArea::resizeEvent(event);
    if (isVisible())
        fill(_stale || columnWidth() != _laidOutWidth);
}

void Table::showEvent(QShowEvent* event)
{
    QAbstractScrollArea::showEvent(event);
    fill(_stale || columnWidth() != _laidOutWidth);
}

void Table::scrollContentsBy(int, int)
{
    if (isVisible())
        fill(false);
}

// Touch and mouse -----------------------------------------------------------------------------------------------

void Table::mousePressEvent(QMouseEvent* event)
{
    if (event->button() != Qt::LeftButton)
        return event->ignore();
    const bool stops = QScroller::scroller(this)->state() == QScroller::Scrolling;
    _press = Press{event->position(), stops ? std::nullopt : rowAt(event->position()), Drag::Undecided, nullptr, {}};
    if (const auto row = rowAt(event->position()))
        if (const Cell* cell = cellAt(*row)) {
            _press->strip = cell->strip();
            _press->name = names()(*row);
        }
    if (_press->row)
        _hold.start(QGuiApplication::styleHints()->mousePressAndHoldInterval());
    feed(*this, QScroller::InputPress, *event, _press->at);
    if (_press->strip)
        feed(*_press->strip, QScroller::InputPress, *event, _press->at);
    refreshLooks();
}

void Table::mouseMoveEvent(QMouseEvent* event)
{
    if (!_press)
        return;
    const QPointF moved = event->position() - _press->at;
    if (_press->drag == Drag::Undecided) {
        if (moved.manhattanLength() < kDragStart)
            return;
        const bool sideways = std::abs(moved.x()) > std::abs(moved.y());
        if (!sideways)
            _press->drag = Drag::Upright;
        else if (moved.x() > 0 && _press->at.x() < kEdge)
            _press->drag = Drag::Ignored; // becomes a swipe back if it is long enough
        else
            _press->drag = _press->strip ? Drag::Sideways : Drag::Ignored;
        _hold.stop();
        refreshLooks();
    }
    if (_press->drag == Drag::Upright)
        feed(*this, QScroller::InputMove, *event, event->position());
    else if (_press->drag == Drag::Sideways && _press->strip)
        feed(*_press->strip, QScroller::InputMove, *event, event->position());
}

void Table::mouseReleaseEvent(QMouseEvent* event)
{
    if (event->button() != Qt::LeftButton || !_press)
        return event->ignore();
    feed(*this, QScroller::InputRelease, *event, event->position());
    if (_press->strip)
        feed(*_press->strip, QScroller::InputRelease, *event, event->position());
    const Press press = *std::exchange(_press, std::nullopt);
    _hold.stop();
    refreshLooks();
    if (press.drag == Drag::Undecided && isOnItsRow(press, event->position())) {
        mark(_current, *press.row);
        select(*press.row);
    } else if (press.drag == Drag::Ignored && press.at.x() < kEdge && event->position().x() - press.at.x() > kSwipe &&
               _swipedBack) {
        _swipedBack();
    }
}

void Table::mouseDoubleClickEvent(QMouseEvent* event)
{
    if (const auto row = rowAt(event->position()); row && event->button() == Qt::LeftButton)
        bringBack(*row);
    mousePressEvent(event);
}

bool Table::viewportEvent(QEvent* event)
{
    if (event->type() != QEvent::ToolTip)
        return QAbstractScrollArea::viewportEvent(event);
    showTip(static_cast<const QHelpEvent&>(*event));
    return true;
}

void Table::showTip(const QHelpEvent& event)
{
    const auto row = rowAt(event.pos());
    const Cell* cell = row ? cellAt(*row) : nullptr;
    if (cell && cell->isCut())
        QToolTip::showText(event.globalPos(), cell->spoken(), viewport(), cell->geometry());
    else
        QToolTip::hideText();
}

bool Table::isOnItsRow(const Press& press, QPointF point)
{
    // Rows may have been added or removed during the press. Another row under the finger is not pressed.
    return press.row && press.row == rowAt(point) && names()(*press.row) == press.name;
}

void Table::wheelEvent(QWheelEvent* event)
{
    QPoint delta = event->pixelDelta().isNull() ? event->angleDelta() / 2 : event->pixelDelta();
    if (event->modifiers() & Qt::ShiftModifier)
        delta = {delta.x() ? delta.x() : delta.y(), 0};
    if (std::abs(delta.x()) > std::abs(delta.y())) {
        if (const auto row = rowAt(event->position()))
            scrollSideways(*row, -delta.x());
    } else {
        verticalScrollBar()->setValue(offset() - delta.y());
    }
    event->accept();
}

void Table::scrollSideways(std::size_t row, double by)
{
    if (Cell* cell = cellAt(row))
        cell->setSideways(cell->sideways() + by);
}

bool Table::bringBack(std::size_t row)
{
    Cell* cell = cellAt(row);
    if (!cell || cell->sideways() <= 0)
        return false;
    if (Strip* strip = cell->strip(); QScroller::hasScroller(strip))
        QScroller::scroller(strip)->stop();
    cell->setSideways(0);
    return true;
}

void Table::select(std::size_t row)
{
    if (_stale && isVisible())
        fill(true);
    if (row >= _rows)
        return;
    mark(_selected, row);
    refreshLooks();
    _source.didSelectRowAtIndexPath(*this, IndexPath{0, row});
}

// The row's menu -------------------------------------------------------------------------------------------------

void Table::held()
{
    if (!_press || !isVisible() || !isEnabled())
        return;
    const Press press = *std::exchange(_press, std::nullopt);
    QScroller::scroller(this)->stop();
    if (press.strip)
        QScroller::scroller(press.strip.data())->stop();
    refreshLooks();
    if (isOnItsRow(press, press.at))
        openMenu(press.row, viewport()->mapToGlobal(press.at).toPoint());
}

void Table::contextMenuEvent(QContextMenuEvent* event)
{
    if (event->reason() == QContextMenuEvent::Keyboard)
        openMenuOfCurrentRow();
    else
        openMenu(rowAt(event->pos()), event->globalPos());
}

void Table::openMenuOfCurrentRow()
{
    if (current())
        scrollTo(*current());
    const Cell* cell = current() ? cellAt(*current()) : nullptr;
    const QPoint at = cell ? cell->geometry().center() : viewport()->rect().center();
    openMenu(current(), viewport()->mapToGlobal(at));
}

void Table::openMenu(std::optional<std::size_t> row, QPoint at)
{
    // Some platforms report one key both as a key and as a menu request.
    if (!_rows || QApplication::activePopupWidget())
        return;
    if (row)
        mark(_current, *row);
    refreshLooks();
    new ContextMenu(*this, row, at);
}

// Keyboard ------------------------------------------------------------------------------------------------------

bool Table::event(QEvent* event)
{
    // A new scheme or font does not change a row's width, but its contents.
    if (event->type() == QEvent::ApplicationFontChange && isVisible())
        fill(true);
    return QAbstractScrollArea::event(event);
}

void Table::keepRing(bool kept)
{
    _ringKept = kept;
    refreshLooks();
}

void Table::makeCurrent(std::size_t row)
{
    scrollTo(row);
    mark(_current, row);
    refreshLooks();
    if (Cell* cell = cellAt(row)) {
        QAccessibleEvent focus(cell, QAccessible::Focus);
        QAccessible::updateAccessibility(&focus);
    }
}

void Table::scrollTo(std::size_t row)
{
    const int top = static_cast<int>(row) * kRowHeight;
    if (top < offset())
        verticalScrollBar()->setValue(top);
    else if (top + kRowHeight > offset() + viewport()->height())
        verticalScrollBar()->setValue(top + kRowHeight - viewport()->height());
}

void Table::keyPressEvent(QKeyEvent* event)
{
    const auto page = static_cast<std::size_t>(std::max(1, viewport()->height() / kRowHeight - 1));
    const auto to = [&](std::size_t row) {
        QScroller::scroller(this)->stop();
        makeCurrent(std::min(row, _rows - 1));
    };
    const std::size_t at = current().value_or(0);
    if (_rows == 0 || event->modifiers() & Qt::AltModifier)
        return event->ignore();
    switch (event->key()) {
    case Qt::Key_C:
        return current() && event->modifiers() == Qt::ControlModifier ? copy(rowAsText(*this, at)) : event->ignore();
    case Qt::Key_F10:
        return event->modifiers() == Qt::ShiftModifier ? openMenuOfCurrentRow() : event->ignore();
    case Qt::Key_Menu:
        return openMenuOfCurrentRow();
    case Qt::Key_Down:
        return to(current() ? at + 1 : 0);
    case Qt::Key_Up:
        return to(at ? at - 1 : 0);
    case Qt::Key_PageDown:
        return to(at + page);
    case Qt::Key_PageUp:
        return to(at > page ? at - page : 0);
    case Qt::Key_Home:
        return bringBack(at) ? makeCurrent(at) : to(0);
    case Qt::Key_End:
        return to(_rows - 1);
    case Qt::Key_Right:
        return current() ? scrollSideways(at, kSidewaysStep) : void();
    case Qt::Key_Left:
        return current() ? scrollSideways(at, -kSidewaysStep) : void();
    case Qt::Key_Return:
    case Qt::Key_Enter:
    case Qt::Key_Select:
        if (current() && !event->isAutoRepeat()) {
            makeCurrent(at);
            select(at);
        }
        return;
    default:
        event->ignore();
    }
}

void Table::focusInEvent(QFocusEvent* event)
{
    QAbstractScrollArea::focusInEvent(event);
    if (FocusRing::instance().isShown() && !current() && _rows)
        mark(_current, static_cast<std::size_t>(offset() / kRowHeight));
    refreshLooks();
}

void Table::focusOutEvent(QFocusEvent* event)
{
    QAbstractScrollArea::focusOutEvent(event);
    refreshLooks();
}

} // namespace kestrum::qt
