#include "frontends/qt/Drawn.h"

#include "frontends/qt/Measures.h"
#include "frontends/qt/Type.h"

#include <QFontMetricsF>
#include <QLinearGradient>
#include <QPainter>
#include <QScrollEvent>
#include <QScrollPrepareEvent>
#include <algorithm>
#include <limits>

namespace kestrum::qt {

void TextLabel::setFrame(Rect frame)
{
    if (frame == _frame)
        return;
    _frame = frame;
    changed();
}

void TextLabel::setText(std::optional<std::string_view> text)
{
    if (text == _text)
        return;
    _text = text;
    _line = lineOf(text.value_or(""));
    changed();
}

void TextLabel::setFont(Font font)
{
    _family = font.family;
    _size = font.size;
    _bold = font.bold;
    _font = fontOf(font);
    changed();
}

void TextLabel::paint(QPainter& painter, const Paper& paper) const
{
    const QFontMetricsF metrics(_font);
    painter.setFont(_font);
    painter.setPen(paper.colours.ink);
    painter.drawText(QPointF(_frame.x, _frame.y + (_frame.height - metrics.height()) / 2 + metrics.ascent()),
                     isCut(paper.width) ? metrics.elidedText(_line, Qt::ElideRight, room(paper.width)) : _line);
}

double TextLabel::room(double width) const
{
    return std::min(_frame.width + 1, width - _frame.x); // + 1: Qt rounds some text widths down
}

bool TextLabel::isCut(double width) const
{
    return QFontMetricsF(_font).horizontalAdvance(_line) > room(width);
}

void Strip::setFrame(Rect frame)
{
    _frame = frame;
    changed();
}

void Strip::addSubview(std::shared_ptr<View> view)
{
    _views.push_back(std::move(view));
    changed();
}

void Strip::setContentSize(Size size)
{
    _content = size;
    changed();
}

void Strip::setOffset(double offset)
{
    _offset = std::clamp(offset, 0.0, reach());
    changed();
}

void Strip::setHolder(QWidget* holder)
{
    Drawn::setHolder(holder);
    for (const auto& view : _views)
        if (auto* drawn = dynamic_cast<Drawn*>(view.get()))
            drawn->setHolder(holder);
}

QStringList Strip::texts() const
{
    QStringList texts;
    for (const auto& view : _views)
        if (const auto* drawn = dynamic_cast<const Drawn*>(view.get()))
            texts += drawn->texts();
    return texts;
}

bool Strip::isCutLeft() const
{
    return std::any_of(_views.begin(), _views.end(),
                       [this](const auto& view) { return view->frame().width > 0 && view->frame().x < offset(); });
}

bool Strip::isCutRight() const
{
    return std::any_of(_views.begin(), _views.end(), [this](const auto& view) {
        const Rect each = view->frame();
        return each.width > 0 && each.x + each.width > offset() + _frame.width;
    });
}

void Strip::paint(QPainter& painter, const Paper& paper) const
{
    constexpr double kFade = 32; // points at an edge over which cut content fades out
    painter.save();
    const QRectF frame = rectOf(_frame);
    painter.setClipRect(frame, Qt::IntersectClip);
    painter.save();
    painter.translate(frame.x() - offset(), frame.y());
    for (const auto& view : _views)
        if (const auto* drawn = dynamic_cast<const Drawn*>(view.get()))
            drawn->paint(painter, {paper.colours, paper.background, std::numeric_limits<double>::infinity()});
    painter.restore();

    QColor clear = paper.background;
    clear.setAlpha(0);
    const auto fade = [&](double from, double to) {
        QLinearGradient gradient(from, 0, to, 0);
        gradient.setColorAt(0, paper.background);
        gradient.setColorAt(0.45, paper.background);
        gradient.setColorAt(1, clear);
        painter.fillRect(QRectF(QPointF(std::min(from, to), frame.top()), QPointF(std::max(from, to), frame.bottom())),
                         gradient);
    };
    if (isCutLeft())
        fade(frame.left(), frame.left() + kFade);
    if (isCutRight()) {
        fade(frame.right(), frame.right() - kFade);
        // The hidden content may begin exactly there, so that nothing fades. Three dots show that there is more.
        painter.setPen(Qt::NoPen);
        painter.setBrush(paper.colours.muted);
        for (int i = 0; i < 3; ++i)
            painter.drawEllipse(QPointF(frame.right() - 2 - 4 * i, kRowHeight / 2.0 + 4), 1.25, 1.25);
    }
    painter.restore();
}

bool Strip::event(QEvent* event)
{
    if (event->type() == QEvent::ScrollPrepare) {
        auto* prepare = static_cast<QScrollPrepareEvent*>(event);
        prepare->setViewportSize({_frame.width, _frame.height});
        prepare->setContentPosRange({0, 0, reach(), 0});
        prepare->setContentPos({offset(), 0});
        prepare->accept();
        return true;
    }
    if (event->type() == QEvent::Scroll) {
        setOffset(static_cast<QScrollEvent*>(event)->contentPos().x());
        return true;
    }
    return QObject::event(event);
}

} // namespace kestrum::qt
