#pragma once

#include <QColor>
#include <QPainter>
#include <QPainterPath>
#include <QWidget>

/// The marks that the window draws without Qt's style.
namespace kestrum::qt {

/// A line one device pixel high, directly above `bottom`.
inline void fillHairline(QPainter& painter, const QWidget& on, double bottom, double from, double to,
                         const QColor& colour)
{
    const double thin = 1 / on.devicePixelRatioF();
    painter.fillRect(QRectF(from, bottom - thin, to - from, thin), colour);
}

inline void strokeMark(QPainter& painter, const QPolygonF& line, const QColor& colour, double width = 1.75)
{
    painter.setBrush(Qt::NoBrush);
    painter.setPen(QPen(colour, width, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
    painter.drawPolyline(line);
}

inline void strokeChevron(QPainter& painter, QPointF middle, Qt::ArrowType towards, const QColor& colour)
{
    const double to = towards == Qt::RightArrow ? 3 : -3;
    strokeMark(painter, {middle + QPointF(-to, -6), middle + QPointF(to, 0), middle + QPointF(-to, 6)}, colour);
}

inline void strokeCheckMark(QPainter& painter, QPointF middle, const QColor& colour)
{
    strokeMark(painter, {middle + QPointF(-6, 0), middle + QPointF(-2, 4.5), middle + QPointF(6, -5)}, colour, 2);
}

/// The ring around the widget that has the keyboard focus.
inline void strokeRing(QPainter& painter, const QRectF& around, const QColor& colour)
{
    painter.setBrush(Qt::NoBrush);
    painter.setPen(QPen(colour, 2));
    painter.drawRoundedRect(around.adjusted(1, 1, -1, -1), 6, 6);
}

} // namespace kestrum::qt
