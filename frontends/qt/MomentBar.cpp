#include "frontends/qt/MomentBar.h"

#include "frontends/qt/Colours.h"
#include "frontends/qt/Drawn.h"
#include "frontends/qt/Measures.h"
#include "frontends/qt/Paint.h"
#include "frontends/qt/Type.h"

#include <QAccessible>
#include <algorithm>
#include <utility>

namespace kestrum::qt {

MomentBar::MomentBar(const std::function<void(Look)>& look, QWidget* parent)
    : QWidget(parent),
      _earlier(Button::Kind::Plain, QStringLiteral("Earlier"), this),
      _live(Button::Kind::Filled, QStringLiteral("Live"), this),
      _later(Button::Kind::Plain, QStringLiteral("Later"), this)
{
    setAutoFillBackground(true);
    for (const auto& [button, asks] :
         {std::pair(&_earlier, Look::Earlier), std::pair(&_live, Look::Freeze), std::pair(&_later, Look::Later)})
        connect(button, &QAbstractButton::clicked, this, [look, asked = asks] { look(asked); });
    hide();
}

void MomentBar::setMoment(const std::optional<FrozenMoment>& moment)
{
    setVisible(moment.has_value());
    _earlier.setVisible(moment && moment->hasEarlier);
    _later.setVisible(moment && moment->hasLater);
    const std::string text = moment ? moment->text : "";
    if (std::exchange(_text, text) == text)
        return;
    setAccessibleName(lineOf(text));
    QAccessibleEvent alert(this, QAccessible::Alert);
    if (moment)
        QAccessible::updateAccessibility(&alert);
}

void MomentBar::resizeEvent(QResizeEvent*)
{
    const int column = std::min(width(), kColumn), left = (width() - column) / 2, third = column / 3;
    int x = left;
    for (Button* each : {&_earlier, &_live, &_later}) {
        each->setGeometry(x, 2, third, kRowHeight);
        x += third;
    }
}

void MomentBar::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    fillHairline(painter, *this, 1 / devicePixelRatioF(), 0, width(), coloursOf(*this).line);
}

} // namespace kestrum::qt
