#include "frontends/qt/Button.h"

#include "frontends/qt/Colours.h"
#include "frontends/qt/FocusRing.h"
#include "frontends/qt/Measures.h"
#include "frontends/qt/Paint.h"
#include "frontends/qt/Type.h"

#include <QFontMetricsF>
#include <QKeyEvent>
#include <QTextOption>
#include <cmath>

namespace kestrum::qt {

namespace {

constexpr int kPad = 18;         // on both sides of a filled button's text
constexpr int kChevronRoom = 14; // to the left of a back button's text

} // namespace

Button::Button(Kind kind, const QString& text, QWidget* parent) : QAbstractButton(parent), _kind(kind)
{
    setText(text);
    setFont(kind == Kind::Back ? fontOf(systemFont(kTextSize)) : semiboldFont(kTextSize));
    setFocusPolicy(Qt::StrongFocus);
    connect(&FocusRing::instance(), &FocusRing::changed, this, QOverload<>::of(&QWidget::update));
}

QSize Button::sizeHint() const
{
    const int width = static_cast<int>(std::ceil(QFontMetricsF(font()).horizontalAdvance(text()))) +
                      (_kind == Kind::Filled ? 2 * kPad : kInset) + (_kind == Kind::Back ? kChevronRoom : kInset);
    return {std::max(width, kRowHeight), kRowHeight};
}

void Button::paintEvent(QPaintEvent*)
{
    const Colours& colours = coloursOf(*this);
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setFont(font());
    const int beside = _kind == Kind::Filled ? 4 : 0; // room for the ring, with a gap
    const QRectF body = QRectF(rect()).adjusted(beside, 4, -beside, -4);
    if (_kind == Kind::Filled) {
        painter.setPen(Qt::NoPen);
        painter.setBrush(colours.accent);
        painter.drawRoundedRect(body, 8, 8);
        if (isDown()) {
            QColor shade = colours.ink;
            shade.setAlphaF(0.15f);
            painter.setBrush(shade);
            painter.drawRoundedRect(body, 8, 8);
        }
    } else if (isDown() || isChecked()) {
        painter.setPen(Qt::NoPen);
        painter.setBrush(isDown() ? colours.pressed() : colours.selected());
        painter.drawRoundedRect(body, 8, 8);
    }
    if (isChecked()) // a shade alone is hard to see
        painter.fillRect(QRectF(body.left() + 8, body.bottom() - 2, body.width() - 16, 2), colours.accent);
    QRectF place = rect();
    if (_kind == Kind::Back) {
        strokeChevron(painter, QPointF(kInset + 3, height() / 2.0), Qt::LeftArrow, colours.accent);
        place.adjust(kInset + kChevronRoom - 2, 0, 0, 0);
    }
    painter.setPen(_kind == Kind::Filled ? colours.onAccent() : colours.accent);
    const Qt::Alignment side = _kind == Kind::Back ? Qt::AlignLeft : Qt::AlignHCenter;
    // A back button without room for its text shows its chevron alone.
    const QFontMetricsF metrics(font());
    if (width() > kRowHeight || metrics.horizontalAdvance(text()) <= place.width())
        painter.drawText(place, metrics.elidedText(text(), Qt::ElideRight, place.width()),
                         QTextOption(side | Qt::AlignVCenter));
    if (hasFocus() && FocusRing::instance().isShown())
        strokeRing(painter, _kind == Kind::Filled ? QRectF(rect()) : body, colours.accent);
}

void Button::keyPressEvent(QKeyEvent* event)
{
    // The widget may just have received the focus; a key held since before must not press it.
    if (event->isAutoRepeat())
        return;
    if (event->key() == Qt::Key_Return || event->key() == Qt::Key_Enter)
        return click();
    QAbstractButton::keyPressEvent(event);
}

} // namespace kestrum::qt
