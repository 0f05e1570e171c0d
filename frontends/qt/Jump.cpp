#include "frontends/qt/Jump.h"

#include "frontends/qt/Colours.h"
#include "frontends/qt/FocusRing.h"
#include "frontends/qt/Measures.h"
#include "frontends/qt/Paint.h"
#include "frontends/qt/Type.h"

#include <QKeyEvent>

namespace kestrum::qt {

namespace {

/// Whether the focus leaves the field. A menu of the field, or another window, does not count.
bool leaves(const QFocusEvent& event)
{
    return event.reason() != Qt::PopupFocusReason && event.reason() != Qt::ActiveWindowFocusReason;
}

} // namespace

Jump::Jump(QWidget* parent) : QWidget(parent), _field(this), _missing(this)
{
    setAutoFillBackground(true);
    _field.setFont(fontOf(systemFont(kTextSize)));
    _field.setFrame(false);
    _field.setPlaceholderText(QStringLiteral("Jump to a name"));
    _field.setAccessibleName(QStringLiteral("Jump to a name"));
    QPalette ground; // the other colours follow the scheme
    ground.setColor(QPalette::Base, Qt::transparent);
    _field.setPalette(ground);
    _missing.setFont(fontOf(systemFont(kStatusSize)));
    _missing.setLine(QStringLiteral("no such row"));
    _missing.hide();
    _field.installEventFilter(this);
    connect(&_field, &QLineEdit::textEdited, this, [this] { follow(); });
    hide();
}

void Jump::start(Table& table)
{
    _table = &table;
    _from = table.current().value_or(0);
    _field.clear();
    _missing.hide();
    table.keepRing(true);
    FocusRing::instance().setShown(true);
    raise();
    show();
    _field.setFocus(Qt::ShortcutFocusReason);
}

void Jump::again(Table& table)
{
    if (!_last.isEmpty())
        go(table, _last, table.current().value_or(0) + 1);
}

void Jump::end()
{
    if (isHidden())
        return;
    if (!_field.text().isEmpty())
        _last = _field.text();
    if (_table)
        _table->keepRing(false);
    hide();
    Q_EMIT ended();
}

void Jump::giveUp()
{
    if (_table && _from < _table->rows())
        _table->makeCurrent(_from);
    _field.clear();
    end();
}

void Jump::follow()
{
    if (!_table)
        return;
    const bool found = go(*_table, _field.text(), _from);
    _missing.setHidden(found);
    if ((!found || _field.text().isEmpty()) && _from < _table->rows())
        _table->makeCurrent(_from);
}

bool Jump::go(Table& table, const QString& name, std::size_t from)
{
    for (std::size_t i = 0; i < table.rows(); ++i) {
        const std::size_t row = (from + i) % table.rows();
        if (!table.nameOf(row).contains(name, Qt::CaseInsensitive))
            continue;
        table.makeCurrent(row);
        return true;
    }
    return false;
}

bool Jump::eventFilter(QObject* watched, QEvent* event)
{
    if (event->type() == QEvent::FocusOut && leaves(*static_cast<QFocusEvent*>(event)))
        end();
    if (event->type() != QEvent::KeyPress)
        return QWidget::eventFilter(watched, event);
    switch (static_cast<QKeyEvent*>(event)->key()) {
    case Qt::Key_Return:
    case Qt::Key_Enter:
        end();
        return true;
    case Qt::Key_Backspace:
        if (!_field.text().isEmpty())
            return false;
        [[fallthrough]];
    case Qt::Key_Escape:
    case Qt::Key_Back:
        giveUp();
        return true;
    default:
        return false;
    }
}

void Jump::resizeEvent(QResizeEvent*)
{
    const int column = std::min(width(), kColumn), left = (width() - column) / 2;
    const int missing = static_cast<int>(_missing.wanted());
    _missing.setGeometry(left + column - kInset - missing, 2, missing, kRowHeight);
    _field.setGeometry(left + kInset - 2, 2, column - 2 * kInset - missing - kGap, kRowHeight);
}

void Jump::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    fillHairline(painter, *this, 1 / devicePixelRatioF(), 0, width(), coloursOf(*this).line);
}

} // namespace kestrum::qt
