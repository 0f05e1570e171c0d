#include "frontends/qt/SaveSheet.h"

#include "frontends/qt/Colours.h"
#include "frontends/qt/Measures.h"
#include "frontends/qt/Paint.h"
#include "frontends/qt/Type.h"

#include <QGuiApplication>
#include <QInputMethod>
#include <QKeyEvent>

namespace kestrum::qt {

namespace {

constexpr int kHeader = 56;
constexpr int kTop = 28;   // points of the screen below that stay in view
constexpr int kWide = 560; // the maximum width of the sheet
constexpr int kField = 48;

} // namespace

void Card::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    painter.setBrush(coloursOf(*this).surface);
    painter.drawRoundedRect(QRectF(rect()).adjusted(0, 0, 0, _bottomSquare ? kRadius : 0), kRadius, kRadius);
}

DescriptionField::DescriptionField(QWidget* parent) : QLineEdit(parent)
{
    // Assistive technology sets a field's text without checking whether the field is covered.
    connect(this, &QLineEdit::textChanged, this, [this](const QString& text) {
        if (isEnabled())
            _kept = text;
        else if (text != _kept)
            setText(_kept);
    });
}

void DescriptionField::resignFirstResponder()
{
    // The sheet keeps the keyboard focus: without a focused widget, Escape and Tab would have no effect.
    if (hasFocus())
        parentWidget()->setFocus(Qt::OtherFocusReason);
    QGuiApplication::inputMethod()->hide();
}

void DescriptionField::paintEvent(QPaintEvent* event)
{
    QLineEdit::paintEvent(event);
    // The field's frame is its lower edge. It has the accent colour and double thickness while the field has the
    // focus.
    const Colours& colours = coloursOf(*this);
    QPainter painter(this);
    const int thick = hasFocus() ? kRing : 1;
    painter.fillRect(0, height() - thick, width(), thick, hasFocus() ? colours.accent : colours.muted);
}

SaveSheet::SaveSheet(SaveInterfaceOwner& owner)
    : _owner(owner),
      _card(this),
      _cancel(Button::Kind::Plain, QStringLiteral("Cancel"), &_card),
      _save(Button::Kind::Filled, QStringLiteral("Save"), &_card),
      _title(&_card),
      _description(&_card),
      _table(owner)
{
    setAccessibleName(QStringLiteral("Save Snapshot"));
    _title.setFont(semiboldFont(kTitleSize));
    _title.setAlignment(Qt::AlignCenter);
    _title.setLine(QStringLiteral("Save Snapshot"));
    _description.setFont(fontOf(systemFont(kTextSize)));
    _description.setFrame(false);
    _description.setTextMargins(-2, 0, -2, 0); // aligned with the rows
    _description.setPlaceholderText(QLatin1String(kDescriptionPlaceholder.data()));
    _description.setAccessibleName(QStringLiteral("Description"));
    _table.setParent(&_card);
    _table.setAccessibleName(QStringLiteral("What is saved"));
    setTabOrder(&_description, &_table);
    setTabOrder(&_table, &_save);
    setTabOrder(&_save, &_cancel);
    // The owner may destroy the sheet, so nothing may use the sheet after this call.
    connect(&_save, &QAbstractButton::clicked, this, [this] { _owner.savePressed(); });
    connect(&_cancel, &QAbstractButton::clicked, this, [this] { _owner.cancelPressed(); });
    connect(&_description, &QLineEdit::returnPressed, this, [this] { _owner.textFieldShouldReturn(); });
    hide();
}

void SaveSheet::setFrame(Rect frame)
{
    setGeometry(rectOf(frame).toRect());
}

void SaveSheet::setRisen(double risen)
{
    _risen = risen;
    arrange();
    update();
}

void SaveSheet::takeFocus()
{
    _description.setFocus(Qt::OtherFocusReason);
}

void SaveSheet::arrange()
{
    const bool narrow = width() < kWide + 4 * kInset;
    const int cardWidth = narrow ? width() : kWide;
    const int rows = std::max(2 * kRowHeight, _table.sizeHint().height());
    const int content = kHeader + kField + 2 * kInset + rows + kInset;
    const int cardHeight = narrow ? height() - kTop : std::min(height() - 2 * kTop, content);
    const int y = narrow ? kTop : (height() - cardHeight) / 2;
    _card.setBottomSquare(narrow);
    _card.setGeometry((width() - cardWidth) / 2, y + qRound((height() - y) * (1 - _risen)), cardWidth, cardHeight);

    const int buttonTop = (kHeader - kRowHeight) / 2;
    const int saveWidth = _save.sizeHint().width(), cancelWidth = _cancel.sizeHint().width();
    _cancel.setGeometry(0, buttonTop, cancelWidth, kRowHeight);
    _save.setGeometry(cardWidth - kInset - saveWidth, buttonTop, saveWidth, kRowHeight);
    const int beside = std::max(cancelWidth, saveWidth + kInset) + kGap;
    _title.setGeometry(beside, buttonTop, std::max(0, cardWidth - 2 * beside), kRowHeight);
    _description.setGeometry(kInset, kHeader + kInset, cardWidth - 2 * kInset, kField);
    const int top = kHeader + kField + 2 * kInset;
    _table.setGeometry(0, top, cardWidth, std::max(0, cardHeight - top - (narrow ? 0 : kInset)));
    _table.setVisible(true);
}

void SaveSheet::resizeEvent(QResizeEvent*)
{
    arrange();
}

void SaveSheet::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    QColor dim = Colours::dim();
    dim.setAlphaF(dim.alphaF() * static_cast<float>(_risen));
    painter.fillRect(rect(), dim);
}

void SaveSheet::keyPressEvent(QKeyEvent* event)
{
    // A key that is still held since the sheet was opened has no effect.
    if (event->isAutoRepeat())
        return;
    if (event->key() == Qt::Key_Escape)
        _owner.cancelPressed();
    else if (event->key() == Qt::Key_S && event->modifiers() == Qt::ControlModifier)
        _save.click();
    // Keys are not passed on to the panes below.
}

void SaveSheet::mousePressEvent(QMouseEvent*)
{
    _owner.backgroundTouched();
}

bool SaveSheet::focusNextPrevChild(bool next)
{
    // Tab stays inside the sheet.
    QWidget* const order[] = {&_description, &_table, &_save, &_cancel};
    const auto count = std::size(order);
    const auto at = static_cast<std::size_t>(std::find(order, order + count, focusWidget()) - order);
    QWidget* to = at == count ? order[0] : order[(at + (next ? 1 : count - 1)) % count];
    to->setFocus(next ? Qt::TabFocusReason : Qt::BacktabFocusReason);
    return true;
}

} // namespace kestrum::qt
