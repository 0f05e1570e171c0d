#include "frontends/qt/SheetView.h"

#include "frontends/qt/Colours.h"
#include "frontends/qt/Drag.h"
#include "frontends/qt/Measures.h"
#include "frontends/qt/Paint.h"
#include "frontends/qt/Type.h"

#include <QGridLayout>
#include <QHeaderView>
#include <QKeyEvent>
#include <QMouseEvent>
#include <QScrollBar>
#include <QStyledItemDelegate>

#include <algorithm>
#include <iterator>
#include <utility>

namespace kestrum::qt {

namespace {

constexpr int kBarThickness = 3;
constexpr int kTableRow = 36; // nothing in it is pressed
constexpr int kPartRole = Qt::UserRole;

void fillBar(QPainter& painter, const QWidget& on, const QRectF& place, double part)
{
    painter.fillRect(place, coloursOf(on).line);
    painter.fillRect(QRectF(place.topLeft(), QSizeF(place.width() * part, place.height())), coloursOf(on).accent);
}

/// A cell with a thin bar under its text.
class BarDelegate final : public QStyledItemDelegate {
public:
    using QStyledItemDelegate::QStyledItemDelegate;

    void paint(QPainter* painter, const QStyleOptionViewItem& option, const QModelIndex& index) const override
    {
        QStyledItemDelegate::paint(painter, option, index);
        const QVariant part = index.data(kPartRole);
        if (!part.isValid() || !option.widget)
            return;
        const QRectF cell = option.rect;
        fillBar(*painter, *option.widget,
                {cell.x() + 4, cell.bottom() - kBarThickness - 2, cell.width() - 8, kBarThickness}, part.toDouble());
    }
};

/// The identity columns of a table that is scrolled sideways.
class FrozenColumns final : public QWidget {
public:
    explicit FrozenColumns(SheetTableView& table) : QWidget(&table), _table(table) {}

protected:
    void paintEvent(QPaintEvent*) override
    {
        QPainter painter(this);
        _table.drawFrozen(painter);
    }
    void mousePressEvent(QMouseEvent*) override {} // not for what is below
    void mouseReleaseEvent(QMouseEvent* event) override { _table.pressFrozen(event->pos()); }

private:
    SheetTableView& _table;
};

/// How many rows stand before those that were shown; 0 when their order has changed, or most of them are gone.
std::size_t rowsAtFront(const std::vector<SheetRow>& rows, const std::vector<SheetRow>& before)
{
    if (before.empty())
        return 0;
    const auto first = std::ranges::find(rows, before.front().identity, &SheetRow::identity);
    const auto common = std::min<std::ptrdiff_t>(rows.end() - first, std::ssize(before));
    const bool same = std::equal(first, first + common, before.begin(),
                                 [](const auto& a, const auto& b) { return a.identity == b.identity; });
    return same && common * 2 >= std::ssize(before) ? static_cast<std::size_t>(first - rows.begin()) : 0;
}

QString textOf(std::string_view text)
{
    return lineOf(text);
}

/// Thin bars that only show the place, as the panes have them: a finger or the wheel scrolls.
void setUpBars(QAbstractScrollArea& area)
{
    for (QScrollBar* bar : {area.verticalScrollBar(), area.horizontalScrollBar()})
        bar->setStyleSheet(
            QStringLiteral("QScrollBar { background: palette(base); border: none; }"
                           "QScrollBar:vertical { width: 4px; } QScrollBar:horizontal { height: 4px; }"
                           "QScrollBar::handle { background: palette(highlight); border-radius: 2px; min-width: 24px; "
                           "min-height: 24px; }"
                           "QScrollBar::add-line, QScrollBar::sub-line { width: 0; height: 0; }"
                           "QScrollBar::add-page, QScrollBar::sub-page { background: none; }"));
}

void setUp(QLabel& label, const QFont& font, bool muted = false)
{
    label.setFont(font);
    label.setTextFormat(Qt::PlainText);
    label.setWordWrap(true);
    label.setSizePolicy(QSizePolicy::Preferred, QSizePolicy::Minimum);
    if (muted)
        label.setForegroundRole(QPalette::PlaceholderText);
}

} // namespace

const SheetCommand* sheetCommandOf(const QKeyEvent& event)
{
    if (event.modifiers() & (Qt::ControlModifier | Qt::AltModifier | Qt::MetaModifier))
        return nullptr;
    const auto* found = std::ranges::find_if(
        kSheetCommands, [&](const auto& command) { return event.text() == QLatin1Char(command.key); });
    return found == kSheetCommands.end() ? nullptr : found;
}

LevelBar::LevelBar(QWidget* parent) : QWidget(parent)
{
    setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Preferred);
}

void LevelBar::setPart(double part)
{
    _part = part;
    update();
}

QSize LevelBar::sizeHint() const
{
    return {60, kBarThickness};
}

void LevelBar::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    fillBar(painter, *this, QRect(0, (height() - kBarThickness) / 2, width(), kBarThickness), _part);
}

SheetTableView::SheetTableView(QAbstractScrollArea& around, QWidget* parent) : QTableWidget(parent)
{
    setFont(fontOf(systemFont(kTextSize)));
    setUpBars(*this);
    setItemDelegate(new BarDelegate(this));
    setEditTriggers(NoEditTriggers);
    setSelectionMode(NoSelection);
    setFrameShape(NoFrame);
    setShowGrid(false);
    setTabKeyNavigation(false);
    auto* drag = new DragScroll(*this, &around);
    _frozen = new FrozenColumns(*this);
    _frozen->installEventFilter(drag);
    _frozen->hide();
    setVerticalScrollMode(ScrollPerPixel);
    setHorizontalScrollMode(ScrollPerPixel);
    verticalHeader()->hide();
    verticalHeader()->setDefaultSectionSize(kTableRow);
    verticalHeader()->setSectionResizeMode(QHeaderView::Fixed);
    horizontalHeader()->setSectionResizeMode(QHeaderView::Fixed);
    horizontalHeader()->setMinimumHeight(kRowHeight);
    horizontalHeader()->setFont(semiboldFont(kStatusSize));
    horizontalHeader()->setHighlightSections(false);
    horizontalHeader()->setStyleSheet(QStringLiteral("QHeaderView { background: palette(base); border: none; } "
                                                     "QHeaderView::section { background: palette(base); color: "
                                                     "palette(text); border: none; padding: 0 6px; }"));
}

void SheetTableView::setHeadings(const SheetTable& table)
{
    for (int i = 0; i < columnCount(); ++i) {
        const auto& column = table.columns[static_cast<std::size_t>(i)];
        QString heading = textOf(column.heading);
        if (!column.unit.empty())
            heading += u' ' + textOf(column.unit);
        if (table.sort && table.sort->column == static_cast<std::size_t>(i))
            heading += table.sort->isDescending ? QStringLiteral(" ↓") : QStringLiteral(" ↑");
        if (auto* item = horizontalHeaderItem(i); !item || item->text() != heading) {
            auto* fresh = new QTableWidgetItem(heading);
            fresh->setTextAlignment(Qt::AlignVCenter | (column.isNumeric ? Qt::AlignRight : Qt::AlignLeft));
            setHorizontalHeaderItem(i, fresh);
            widen(i, QFontMetrics(horizontalHeader()->font()).horizontalAdvance(heading));
        }
    }
}

void SheetTableView::setRow(int row, const SheetTable& table, const SheetRow& shown)
{
    for (int i = 0; i < columnCount(); ++i) {
        const auto& column = table.columns[static_cast<std::size_t>(i)];
        const auto& cell = shown.cells[static_cast<std::size_t>(i)];
        QString text = textOf(cell.text);
        if (!cell.word.empty())
            text += QStringLiteral("  ") + textOf(cell.word);
        if (i == 0 && shown.isReference)
            text.prepend(QStringLiteral("Serving "));
        else if (i == 0 && shown.moved != SheetRow::Moved::No)
            text.prepend(shown.moved == SheetRow::Moved::Up ? QStringLiteral("↑ ") : QStringLiteral("↓ "));
        auto* item = this->item(row, i);
        if (!item)
            setItem(row, i, item = new QTableWidgetItem);
        item->setText(text);
        item->setData(kPartRole, cell.bar ? QVariant(*cell.bar) : QVariant());
        item->setTextAlignment(Qt::AlignVCenter | (column.isNumeric ? Qt::AlignRight : Qt::AlignLeft));
        item->setFont(shown.isReference ? semiboldFont(kTextSize) : font());
        widen(i, QFontMetrics(item->font()).horizontalAdvance(text));
    }
}

void SheetTableView::widen(int column, int width)
{
    constexpr int kAround = 16; // of a cell's and a heading's text
    if (width + kAround > columnWidth(column))
        setColumnWidth(column, width + kAround);
}

void SheetTableView::insertAtFront(std::size_t rows)
{
    const int offset = verticalScrollBar()->value(), count = static_cast<int>(rows);
    model()->insertRows(0, count);
    _table.rows.insert(_table.rows.begin(), rows, {});
    if (offset == 0)
        return; // who looks at the newest row wants the next one too
    updateGeometries();
    verticalScrollBar()->setValue(offset + count * kTableRow);
}

void SheetTableView::setTable(const SheetTable& table)
{
    if (table == _table)
        return;
    if (table.columns != _table.columns) {
        _table = {};
        setRowCount(0);
        setColumnCount(static_cast<int>(table.columns.size()));
        for (int i = 0; i < columnCount(); ++i)
            setColumnWidth(i, kRowHeight);
    }
    if (const std::size_t fresh = rowsAtFront(table.rows, _table.rows))
        insertAtFront(fresh);
    setRowCount(static_cast<int>(table.rows.size()));
    setHeadings(table);
    for (std::size_t i = 0; i < table.rows.size(); ++i)
        if (i >= _table.rows.size() || table.rows[i] != _table.rows[i])
            setRow(static_cast<int>(i), table, table.rows[i]);
    _table = table;
    arrangeFrozen();
}

int SheetTableView::identityColumns() const
{
    const auto end = std::ranges::find(_table.columns, false, &SheetColumn::isIdentity);
    return static_cast<int>(end - _table.columns.begin());
}

void SheetTableView::arrangeFrozen()
{
    int width = 0;
    for (int i = 0; i < identityColumns(); ++i)
        width += columnWidth(i);
    _frozen->setGeometry(0, 0, width, viewport()->geometry().bottom() + 1);
    // On a narrow screen they would leave too little of the others.
    _frozen->setVisible(horizontalScrollBar()->value() > 0 && width < viewport()->width() * 2 / 3);
    _frozen->update();
}

void SheetTableView::drawFrozen(QPainter& painter)
{
    const Colours& colours = coloursOf(*this);
    const int top = horizontalHeader()->height();
    painter.fillRect(_frozen->rect(), colours.surface);
    painter.fillRect(QRectF(_frozen->width() - 1, 0, 1, _frozen->height()), colours.line);
    painter.setPen(colours.ink);
    painter.setFont(horizontalHeader()->font());
    for (int i = 0, x = 0; i < identityColumns(); x += columnWidth(i++)) {
        const auto* heading = horizontalHeaderItem(i);
        painter.drawText(QRect(x + 6, 0, columnWidth(i) - 12, top), heading->textAlignment(), heading->text());
    }
    painter.setClipRect(QRect(0, top, _frozen->width(), _frozen->height()));
    QStyleOptionViewItem option;
    initViewItemOption(&option);
    for (int row = std::max(rowAt(0), 0); row < rowCount() && rowViewportPosition(row) < viewport()->height(); ++row)
        for (int i = 0, x = 0; i < identityColumns(); x += columnWidth(i++)) {
            option.rect = {x, top + rowViewportPosition(row), columnWidth(i), rowHeight(row)};
            itemDelegate()->paint(&painter, option, model()->index(row, i));
        }
}

void SheetTableView::pressFrozen(QPoint at)
{
    if (at.y() >= horizontalHeader()->height() || !horizontalHeader()->sectionsClickable())
        return;
    for (int i = 0, x = 0; i < identityColumns(); ++i)
        if (x += columnWidth(i); at.x() < x) {
            Q_EMIT horizontalHeader()->sectionClicked(i);
            return;
        }
}

void SheetTableView::resizeEvent(QResizeEvent* event)
{
    QTableWidget::resizeEvent(event);
    arrangeFrozen();
}

void SheetTableView::scrollContentsBy(int dx, int dy)
{
    QTableWidget::scrollContentsBy(dx, dy);
    arrangeFrozen();
}

void SheetTableView::fitRows()
{
    setVerticalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff); // a finger scrolls it
    setFixedHeight(kRowHeight + rowCount() * kTableRow);
}

SheetPartView::SheetPartView(const PlotActions& actions, QAbstractScrollArea& around, QWidget* parent)
    : QWidget(parent),
      _caption(this),
      _lines(this),
      _facts(this),
      _note(this),
      _levels(this),
      _plot(actions, this),
      _table(around, this)
{
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(kGap / 2);
    setUp(_caption, semiboldFont(kTextSize));
    setUp(_lines, fontOf(systemFont(kTextSize)));
    setUp(_facts, fontOf(systemFont(kTextSize)));
    setUp(_note, fontOf(systemFont(kStatusSize)), true);
    auto* grid = new QGridLayout(&_levels);
    grid->setContentsMargins(kInset, 0, kInset, 0);
    for (QLabel* each : {&_caption, &_lines, &_facts, &_note})
        each->setContentsMargins(kInset, 0, kInset, 0);
    layout->addWidget(&_caption);
    layout->addWidget(&_lines);
    layout->addWidget(&_facts);
    layout->addWidget(&_levels);
    layout->addWidget(&_plot, 1);
    layout->addWidget(&_table, 1);
    layout->addWidget(&_note);
}

void SheetPartView::setPart(const SheetPart& part, bool alone)
{
    const auto show = [](QLabel& label, const QString& text) {
        label.setText(text);
        label.setVisible(!text.isEmpty());
    };
    QStringList facts;
    for (const auto& [heading, value] : part.facts)
        if (!value.bar) // no break between a name and its value
            facts << QString(textOf(heading) + u' ' + textOf(value.text)).replace(u' ', QChar::Nbsp);
    QStringList lines;
    for (const auto& line : part.lines)
        lines << textOf(line);
    show(_caption, textOf(part.caption));
    show(_lines, lines.join(QStringLiteral("\n\n")));
    show(_facts, facts.join(QStringLiteral("   ")));
    show(_note, textOf(part.note));
    setLevels(part);
    _plot.setVisible(part.plot.has_value());
    if (part.plot)
        _plot.setPlot(*part.plot);
    _table.setVisible(!part.table.rows.empty());
    _table.setTable(part.table);
    _table.setAccessibleName(textOf(part.caption));
    if (!alone)
        _table.fitRows();
}

void SheetPartView::setLevels(const SheetPart& part)
{
    auto& grid = static_cast<QGridLayout&>(*_levels.layout());
    std::size_t used = 0;
    for (const auto& [heading, value] : part.facts) {
        if (!value.bar)
            continue;
        if (used == _shownLevels.size()) {
            const int row = static_cast<int>(used);
            Level level{new QLabel(&_levels), new QLabel(&_levels), new LevelBar(&_levels), new QLabel(&_levels)};
            for (QLabel* each : {level.name, level.value, level.word}) {
                setUp(*each, fontOf(systemFont(kTextSize)));
                each->setWordWrap(false);
            }
            grid.addWidget(level.name, row, 0);
            grid.addWidget(level.value, row, 1, Qt::AlignRight);
            grid.addWidget(level.bar, row, 2);
            grid.addWidget(level.word, row, 3);
            _shownLevels.push_back(level);
        }
        const auto& [name, number, bar, word] = _shownLevels[used++];
        name->setText(textOf(heading));
        number->setText(textOf(value.text));
        bar->setPart(*value.bar);
        word->setText(textOf(value.word));
        // One sentence for a screen reader, which reads label after label.
        name->setAccessibleName(QStringLiteral("%1, %2, %3").arg(name->text(), number->text(), word->text()));
    }
    for (std::size_t i = 0; i < _shownLevels.size(); ++i)
        for (QWidget* each : std::initializer_list<QWidget*>{_shownLevels[i].name, _shownLevels[i].value,
                                                             _shownLevels[i].bar, _shownLevels[i].word})
            each->setVisible(i < used);
    _levels.setVisible(used > 0);
}

SheetView::SheetView(SheetOwner& owner, QWidget* parent)
    : QWidget(parent),
      _owner(&owner),
      _layout(this),
      _back(Button::Kind::Back, QStringLiteral("Back"), this),
      _title(this),
      _status(this),
      _insideLayout(&_inside),
      _hint(&_inside),
      _rest(&_inside)
{
    setAutoFillBackground(true);
    setBackgroundRole(QPalette::Base);
    setFocusPolicy(Qt::StrongFocus);
    setUp(_title, semiboldFont(kTitleSize));
    setUp(_hint, fontOf(systemFont(kTextSize)), true);
    setUp(_status, fontOf(systemFont(kStatusSize)));
    _hint.setContentsMargins(kInset, 0, kInset, 0);
    _status.setContentsMargins(kInset, 0, kInset, 0);
    _status.setFixedHeight(kRowHeight);
    _title.setAlignment(Qt::AlignCenter);

    auto* bar = new QHBoxLayout;
    bar->addWidget(&_back);
    bar->addWidget(&_title, 1);
    bar->addSpacing(_back.sizeHint().width()); // so that the title stands in the middle
    _back.setFixedHeight(kRowHeight);
    _back.setAccessibleName(QStringLiteral("Back to the panes"));
    connect(&_back, &QAbstractButton::clicked, this, [this] { leave(); });

    _insideLayout.setContentsMargins(0, kGap, 0, kGap);
    _insideLayout.setSpacing(kGap);
    _insideLayout.addWidget(&_hint);
    _insideLayout.addWidget(&_rest, 1);
    _scroll.setFrameShape(QFrame::NoFrame);
    _scroll.setWidgetResizable(true);
    _scroll.setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    _scroll.setWidget(&_inside);
    _scroll.setFocusPolicy(Qt::NoFocus);
    setUpBars(_scroll);
    new DragScroll(_scroll);
    _layout.setContentsMargins(0, 2, 0, 0);
    _layout.setSpacing(0);
    _layout.addLayout(bar);
    _layout.addWidget(&_scroll, 1);
    _layout.addWidget(&_status);
}

void SheetView::setContents(const SheetContents& contents)
{
    _canSort = contents.canSort;
    _title.setText(textOf(contents.title));
    setAccessibleName(_title.text());
    _status.setText(textOf(contents.status));
    _hint.setText(textOf(contents.hint));
    _hint.setVisible(contents.parts.empty() && !contents.hint.empty());
    const bool alone = contents.parts.size() == 1;
    while (_parts.size() > contents.parts.size()) {
        delete _parts.back();
        _parts.pop_back();
    }
    while (_parts.size() < contents.parts.size()) {
        auto* part = new SheetPartView(plotActions(), _scroll, &_inside);
        _insideLayout.insertWidget(_insideLayout.count() - 1, part);
        connect(part->table().horizontalHeader(), &QHeaderView::sectionClicked, this, [this](int column) {
            if (_owner && _canSort)
                _owner->columnChosen(static_cast<std::size_t>(column));
        });
        _parts.push_back(part);
    }
    for (std::size_t i = 0; i < _parts.size(); ++i) {
        _parts[i]->table().horizontalHeader()->setSectionsClickable(_canSort);
        _parts[i]->setPart(contents.parts[i], alone);
    }
    // A table or a curve that is alone has the room that is left.
    const auto grows = [](const SheetPart& part) {
        return !part.table.rows.empty() || (part.plot && !part.plot->numbers.empty());
    };
    const bool fills = alone && grows(contents.parts.front());
    _rest.setVisible(!fills);
    if (!_parts.empty())
        _insideLayout.setStretchFactor(_parts.front(), fills ? 1 : 0);
}

PlotActions SheetView::plotActions()
{
    return {[this](std::optional<std::size_t> to) {
                if (_owner)
                    _owner->cursorMoved(to);
            },
            [this](std::size_t range) {
                if (_owner)
                    _owner->rangeChosen(range);
            }};
}

PlotView* SheetView::plot()
{
    for (auto* part : _parts)
        if (!part->plot().isHidden())
            return &part->plot();
    return nullptr;
}

void SheetView::leave()
{
    if (_owner)
        _owner->sheetLeft();
}

void SheetView::keyPressEvent(QKeyEvent* event)
{
    const int key = event->key();
    const bool alt = event->modifiers() == Qt::AltModifier;
    const bool leaves = key == Qt::Key_Escape || key == Qt::Key_Backspace || key == Qt::Key_Back ||
                        (alt && key == Qt::Key_Left) || sheetCommandOf(*event);
    if (PlotView* const shown = plot(); shown && shown->handle(*event))
        return;
    if (leaves && !event->isAutoRepeat())
        leave();
    else if (key == Qt::Key_Down || key == Qt::Key_PageDown)
        scroll(key == Qt::Key_Down ? QAbstractSlider::SliderSingleStepAdd : QAbstractSlider::SliderPageStepAdd);
    else if (key == Qt::Key_Up || key == Qt::Key_PageUp)
        scroll(key == Qt::Key_Up ? QAbstractSlider::SliderSingleStepSub : QAbstractSlider::SliderPageStepSub);
    else if ((key == Qt::Key_Left || key == Qt::Key_Right) && !_parts.empty())
        _parts.front()->table().horizontalScrollBar()->triggerAction(
            key == Qt::Key_Left ? QAbstractSlider::SliderSingleStepSub : QAbstractSlider::SliderSingleStepAdd);
    else
        event->ignore();
}

void SheetView::scroll(QAbstractSlider::SliderAction action)
{
    auto& area = _parts.size() == 1 ? static_cast<QAbstractScrollArea&>(_parts.front()->table()) : _scroll;
    area.verticalScrollBar()->triggerAction(action);
}

void SheetView::mousePressEvent(QMouseEvent* event)
{
    if (event->button() == Qt::BackButton)
        leave();
    else
        event->ignore();
}

void SheetView::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    fillHairline(painter, *this, _scroll.y(), 0, width(), coloursOf(*this).line);
    fillHairline(painter, *this, _status.y(), 0, width(), coloursOf(*this).line);
}

} // namespace kestrum::qt
