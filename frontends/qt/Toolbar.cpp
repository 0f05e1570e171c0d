#include "frontends/qt/Toolbar.h"

#include "frontends/qt/Button.h"
#include "frontends/qt/Colours.h"
#include "frontends/qt/Measures.h"
#include "frontends/qt/Motion.h"
#include "frontends/qt/Paint.h"
#include "frontends/qt/Type.h"

#include <QFontMetricsF>
#include <cmath>

namespace kestrum::qt {

Spinner::Spinner(QWidget* parent) : QWidget(parent)
{
    resize(kSpinner, kSpinner);
    setAccessibleName(QStringLiteral("In progress"));
    _turning.setStartValue(0.0);
    _turning.setEndValue(360.0);
    _turning.setDuration(1000);
    _turning.setLoopCount(-1);
    connect(&_turning, &QVariantAnimation::valueChanged, this, [this] {
        update();
        turn();
    });
}

void Spinner::setRunning(bool running)
{
    _running = running;
    setVisible(running);
    turn();
}

void Spinner::turn()
{
    const bool turns = isVisible() && motionWanted();
    if (turns == (_turning.state() == QAbstractAnimation::Running))
        return;
    if (turns)
        _turning.start();
    else
        _turning.stop();
}

void Spinner::showEvent(QShowEvent*)
{
    turn();
}

void Spinner::hideEvent(QHideEvent*)
{
    _turning.stop();
}

void Spinner::paintEvent(QPaintEvent*)
{
    const Colours& colours = coloursOf(*this);
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    const QRectF circle = QRectF(rect()).adjusted(2.5, 2.5, -2.5, -2.5);
    painter.setPen(QPen(colours.line, 2));
    painter.drawEllipse(circle);
    painter.setPen(QPen(colours.muted, 2, Qt::SolidLine, Qt::RoundCap));
    // In sixteenths of a degree, counterclockwise from three o'clock.
    painter.drawArc(circle, qRound((90 - _turning.currentValue().toDouble()) * 16), -100 * 16);
}

void LineLabel::setLine(const QString& line)
{
    _line = line;
    setAccessibleName(line);
    setText(isCut() ? QFontMetricsF(font()).elidedText(_line, Qt::ElideRight, width()) : _line);
}

void LineLabel::setLines(int lines)
{
    setWordWrap(lines > 1);
    _lines = lines;
    setLine(_line);
}

bool LineLabel::isCut() const
{
    const QFontMetricsF metrics(font());
    if (metrics.horizontalAdvance(_line) <= width())
        return false;
    const QRectF wrapped = metrics.boundingRect(QRectF(rect()), Qt::TextWordWrap, _line);
    return _lines == 1 || wrapped.width() > width() || wrapped.height() > (_lines + 0.5) * metrics.lineSpacing();
}

double LineLabel::wanted() const
{
    return std::ceil(QFontMetricsF(font()).horizontalAdvance(_line)) + 1;
}

void LineLabel::resizeEvent(QResizeEvent* event)
{
    QLabel::resizeEvent(event);
    setLine(_line);
}

Toolbar::Toolbar()
{
    setAutoFillBackground(true);
    hide();
}

Button* Toolbar::save() const
{
    for (const Item& each : _items)
        if (std::holds_alternative<SaveItem>(each.item))
            return static_cast<Button*>(each.widget);
    return nullptr;
}

QSize Toolbar::sizeHint() const
{
    return {kPhoneWidth, kBarHeight};
}

QWidget* Toolbar::makeWidget(const ToolbarItem& item)
{
    QWidget* widget = nullptr;
    if (std::holds_alternative<ActivityIndicatorItem>(item)) {
        widget = new Spinner(this);
    } else if (std::holds_alternative<LabelItem>(item)) {
        auto* label = new LineLabel(this);
        label->setTextFormat(Qt::PlainText);
        widget = label;
    } else if (std::holds_alternative<SaveItem>(item)) {
        auto* save = new Button(Button::Kind::Plain, QStringLiteral("Save"), this);
        connect(save, &QAbstractButton::clicked, this, [this] {
            // The action may replace this bar's items.
            if (const auto action = _saveAction)
                action();
        });
        widget = save;
    }
    if (widget)
        widget->show();
    return widget;
}

void Toolbar::setItems(std::vector<ToolbarItem> items)
{
    for (std::size_t i = 0; i < items.size(); ++i) {
        if (i == _items.size())
            _items.push_back({items[i], makeWidget(items[i])});
        else if (_items[i].item.index() != items[i].index()) {
            if (_items[i].widget)
                _items[i].widget->deleteLater();
            _items[i].widget = makeWidget(items[i]);
        }
        QWidget* widget = _items[i].widget;
        if (const auto* indicator = std::get_if<ActivityIndicatorItem>(&items[i])) {
            static_cast<Spinner*>(widget)->setRunning(indicator->running);
        } else if (const auto* label = std::get_if<LabelItem>(&items[i])) {
            widget->setFont(fontOf(label->font));
            static_cast<LineLabel*>(widget)->setLine(lineOf(label->text));
        } else if (const auto* save = std::get_if<SaveItem>(&items[i])) {
            _saveAction = save->action;
        }
        _items[i].item = std::move(items[i]);
    }
    while (_items.size() > items.size()) {
        if (QWidget* widget = _items.back().widget) {
            widget->hide();
            widget->deleteLater();
        }
        _items.pop_back();
    }
    arrange();
}

void Toolbar::arrange()
{
    struct Place {
        QWidget* widget;
        double width;
    };
    std::vector<Place> places;
    double taken = 0, spaces = 0;
    for (const Item& item : _items) {
        if (!item.widget) {
            ++spaces;
            places.push_back({nullptr, 0});
            continue;
        }
        if (item.widget->isHidden())
            continue;
        const auto* label = dynamic_cast<const LineLabel*>(item.widget);
        const double width = label                                       ? label->wanted()
                             : dynamic_cast<const Spinner*>(item.widget) ? kSpinner
                                                                         : item.widget->sizeHint().width();
        places.push_back({item.widget, width});
        taken += width + kGap;
    }
    const double column = std::min(width(), kColumn);
    // A button includes its inset at the end.
    const double room = column - kInset - (taken - kGap);
    double x = (width() - column) / 2 + kInset;
    for (const Place& place : places) {
        if (!place.widget) {
            x += std::max(0.0, room / spaces);
            continue;
        }
        double width = place.width;
        if (room < 0 && dynamic_cast<const LineLabel*>(place.widget))
            width = std::max(0.0, width + room);
        const int height = dynamic_cast<const Spinner*>(place.widget) ? kSpinner : kRowHeight;
        place.widget->setGeometry(qRound(x), (kBarHeight - height) / 2 + 1, qRound(width), height);
        x += width + kGap;
    }
}

void Toolbar::resizeEvent(QResizeEvent*)
{
    arrange();
}

void Toolbar::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    fillHairline(painter, *this, 1 / devicePixelRatioF(), 0, width(), coloursOf(*this).line);
}

} // namespace kestrum::qt
