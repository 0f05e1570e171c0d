#include "frontends/qt/Drag.h"

#include <QAbstractScrollArea>
#include <QMouseEvent>
#include <QScrollBar>
#include <QScrollerProperties>

#include <cmath>

namespace kestrum::qt {

void feed(QObject& target, QScroller::Input input, const QMouseEvent& event, QPointF at)
{
    QScroller::scroller(&target)->handleInput(input, at, static_cast<qint64>(event.timestamp()));
}

void setUpScroller(QObject& target)
{
    QScrollerProperties properties;
    properties.setScrollMetric(QScrollerProperties::VerticalOvershootPolicy, QScrollerProperties::OvershootAlwaysOff);
    properties.setScrollMetric(QScrollerProperties::HorizontalOvershootPolicy, QScrollerProperties::OvershootAlwaysOff);
    properties.setScrollMetric(QScrollerProperties::DragStartDistance, 0.0);
    QScroller::scroller(&target)->setScrollerProperties(properties);
}

DragScroll::DragScroll(QAbstractScrollArea& area, QAbstractScrollArea* outer)
    : QObject(&area), _area(area), _outer(outer)
{
    setUpScroller(*area.viewport());
    area.viewport()->installEventFilter(this);
}

QWidget& DragScroll::viewportFor(QPointF way) const
{
    const bool upright = std::abs(way.y()) >= std::abs(way.x());
    return *(_outer && upright && _area.verticalScrollBar()->maximum() == 0 ? *_outer : _area).viewport();
}

bool DragScroll::eventFilter(QObject*, QEvent* event)
{
    const auto type = event->type();
    if (type != QEvent::MouseButtonPress && type != QEvent::MouseMove && type != QEvent::MouseButtonRelease)
        return false;
    const auto& mouse = static_cast<const QMouseEvent&>(*event);
    const auto pass = [&](QScroller::Input input, QPointF at) {
        feed(*_moved, input, mouse, _moved->mapFromGlobal(at));
    };
    if (type == QEvent::MouseButtonPress) {
        if (mouse.button() == Qt::LeftButton) {
            QScroller::scroller(_area.viewport())->stop();
            _pressed = mouse.globalPosition();
            _moved = nullptr;
        }
        return false;
    }
    if (type == QEvent::MouseMove && !(mouse.buttons() & Qt::LeftButton))
        _pressed.reset(); // another widget had the release
    if (!_pressed)
        return false;
    if (type == QEvent::MouseMove) {
        if (const QPointF way = mouse.globalPosition() - *_pressed; !_moved && way.manhattanLength() >= kDragStart) {
            _moved = &viewportFor(way);
            pass(QScroller::InputPress, *_pressed);
        }
        if (_moved)
            pass(QScroller::InputMove, mouse.globalPosition());
    } else if (mouse.button() == Qt::LeftButton) {
        _pressed.reset();
        if (_moved)
            pass(QScroller::InputRelease, mouse.globalPosition());
    }
    return _moved;
}

} // namespace kestrum::qt
