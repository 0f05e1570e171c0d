#include "frontends/qt/Alert.h"

#include "frontends/qt/Colours.h"
#include "frontends/qt/Measures.h"
#include "frontends/qt/Type.h"

#include <QAccessible>
#include <QKeyEvent>
#include <QPainter>
#include <QVBoxLayout>

namespace kestrum::qt {

Alert::Alert(const QString& title, const QString& message, const QString& button, std::function<void()> closed,
             QWidget* parent)
    : QWidget(parent),
      _closed(std::move(closed)),
      _card(this),
      _title(title, &_card),
      _message(message, &_card),
      _button(Button::Kind::Filled, button, &_card)
{
    setAccessibleName(title);
    setAccessibleDescription(message);
    _title.setFont(semiboldFont(kTitleSize));
    _message.setFont(fontOf(systemFont(kTextSize)));
    for (QLabel* label : {&_title, &_message}) {
        label->setTextFormat(Qt::PlainText);
        label->setWordWrap(true);
        label->setAlignment(Qt::AlignHCenter);
    }
    auto* lines = new QVBoxLayout(&_card);
    lines->setContentsMargins(20, 20, 20, 16);
    lines->setSpacing(0);
    lines->addWidget(&_title);
    lines->addSpacing(6);
    lines->addWidget(&_message);
    lines->addSpacing(16);
    lines->addWidget(&_button);
    connect(&_button, &QAbstractButton::clicked, this, [this] { close(); });
    colour();
    setGeometry(parent->rect());
    show();
    raise();
    _button.setFocus(Qt::OtherFocusReason);
    QAccessibleEvent alert(this, QAccessible::Alert);
    QAccessible::updateAccessibility(&alert);
}

void Alert::colour()
{
    QPalette palette = _title.palette();
    palette.setColor(QPalette::WindowText, coloursOf(*this).danger);
    _title.setPalette(palette);
}

void Alert::changeEvent(QEvent* event)
{
    if (event->type() == QEvent::PaletteChange)
        colour();
    QWidget::changeEvent(event);
}

void Alert::close()
{
    const auto closed = std::exchange(_closed, nullptr);
    if (!closed)
        return;
    hide();
    deleteLater();
    closed();
}

void Alert::resizeEvent(QResizeEvent*)
{
    const int cardWidth = std::min(300, width() - 4 * kInset);
    const int cardHeight = _card.layout()->totalHeightForWidth(cardWidth);
    _card.setGeometry((width() - cardWidth) / 2, (height() - cardHeight) / 2, cardWidth, cardHeight);
}

void Alert::paintEvent(QPaintEvent*)
{
    QPainter(this).fillRect(rect(), Colours::dim());
}

void Alert::keyPressEvent(QKeyEvent* event)
{
    if (event->isAutoRepeat())
        return;
    if (event->key() == Qt::Key_Escape || event->key() == Qt::Key_Return || event->key() == Qt::Key_Enter)
        close();
}

} // namespace kestrum::qt
