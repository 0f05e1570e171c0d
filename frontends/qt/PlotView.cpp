#include "frontends/qt/PlotView.h"

#include "frontends/qt/Colours.h"
#include "frontends/qt/Drag.h"
#include "frontends/qt/FocusRing.h"
#include "frontends/qt/Measures.h"
#include "frontends/qt/Paint.h"
#include "frontends/qt/PlotShape.h"
#include "frontends/qt/Type.h"

#include <QAccessible>
#include <QHBoxLayout>
#include <QKeyEvent>
#include <QMouseEvent>
#include <QTextOption>

#include <algorithm>
#include <cmath>
#include <ranges>
#include <utility>

namespace kestrum::qt {

namespace {

constexpr int kLeastHeight = 160, kUsualHeight = 300, kStripHeight = 56;
constexpr double kDot = 4;             // the radius of the cursor's
constexpr double kThin = 1, kTick = 8; // of a mark: a faint line, and a tick at its foot

/// A text over the curve stays legible.
void drawOver(QPainter& painter, const QRectF& place, const QString& text, QColor behind, const QColor& colour)
{
    behind.setAlphaF(0.85f);
    painter.fillRect(place, behind);
    painter.setPen(colour);
    painter.drawText(place, Qt::AlignCenter, text);
}

/// In short pieces: the cost of a line grows faster than its length.
void strokeLine(QPainter& painter, const QPolygonF& line, const QColor& colour)
{
    constexpr int kPiece = 8;
    painter.setPen(QPen(colour, 1.5, Qt::SolidLine, Qt::RoundCap, Qt::BevelJoin));
    if (line.size() == 1)
        painter.drawPoint(line.front());
    for (qsizetype from = 0; from + 1 < line.size(); from += kPiece)
        painter.drawPolyline(line.constData() + from,
                             static_cast<int>(std::min<qsizetype>(kPiece + 1, line.size() - from)));
}

} // namespace

Plot::Plot(const PlotActions& actions, QWidget* parent) : QWidget(parent), _actions(actions)
{
    setFont(fontOf(systemFont(kStatusSize)));
    setFocusPolicy(Qt::TabFocus);
    setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Expanding);
    connect(&FocusRing::instance(), &FocusRing::changed, this, QOverload<>::of(&QWidget::update));
}

void Plot::setPlot(const SheetPlot& plot)
{
    const bool wasStrip = isStrip();
    _plot = plot;
    setMaximumHeight(isStrip() ? minimumSizeHint().height() : QWIDGETSIZE_MAX);
    if (isStrip() != wasStrip)
        updateGeometry();
    update();
}

QSize Plot::minimumSizeHint() const
{
    return {200, (isStrip() ? kStripHeight : kLeastHeight) + lineHeight()};
}

QSize Plot::sizeHint() const
{
    return {kPhoneWidth, isStrip() ? minimumSizeHint().height() : kUsualHeight};
}

int Plot::besideTheAxis() const
{
    int widest = 0;
    for (const auto& number : _plot.numbers)
        widest = std::max(widest, fontMetrics().horizontalAdvance(lineOf(number)));
    return widest ? widest + kGap : 0;
}

QRectF Plot::place() const
{
    return QRectF(rect()).adjusted(kInset + besideTheAxis(), 4, -kInset, -lineHeight() - 4);
}

void Plot::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    if (isStrip()) {
        drawStrip(painter);
        drawMarks(painter);
    } else { // the curve over the marks: the cell may change often
        drawGround(painter);
        drawMarks(painter);
        drawCurve(painter);
    }
    drawWords(painter);
    drawTexts(painter);
    drawCursor(painter);
    if (hasFocus() && FocusRing::instance().isShown())
        strokeRing(painter, rect(), coloursOf(*this).accent);
}

void Plot::drawGround(QPainter& painter) const
{
    const Colours& colours = coloursOf(*this);
    const QRectF within = place();
    const PlotShape shape(_plot, within);
    for (std::size_t i = 0; i < _plot.bands.size(); i += 2)
        painter.fillRect(shape.band(i), colours.pressed());
    const double thin = 1 / devicePixelRatioF();
    for (const double y : {within.top(), within.center().y(), within.bottom()})
        painter.fillRect(QRectF(within.left(), y, within.width(), thin), colours.line);
}

void Plot::drawCurve(QPainter& painter) const
{
    const Colours& colours = coloursOf(*this);
    const PlotShape shape(_plot, place());
    painter.setPen(Qt::NoPen);
    painter.setBrush(colours.spread());
    for (const QPolygonF& spread : shape.spreads())
        painter.drawPolygon(spread);
    for (const QPolygonF& line : shape.lines())
        strokeLine(painter, line, colours.accent);
}

void Plot::drawWords(QPainter& painter) const
{
    const Colours& colours = coloursOf(*this);
    const PlotShape shape(_plot, place());
    for (std::size_t i = 0; i < _plot.bands.size(); ++i) {
        const QRectF band = shape.band(i);
        const QString word = lineOf(_plot.bands[i].word);
        const QRectF label(band.left() + 2, band.center().y() - lineHeight() / 2.0,
                           fontMetrics().horizontalAdvance(word) + 4, lineHeight());
        if (band.height() >= label.height())
            drawOver(painter, label, word, i % 2 ? colours.surface : colours.pressed(), colours.muted);
    }
}

void Plot::drawStrip(QPainter& painter) const
{
    const Colours& colours = coloursOf(*this);
    const PlotShape shape(_plot, place());
    painter.fillRect(place(), colours.ground);
    std::vector<std::string_view> states; // one has one shade
    for (std::size_t i = 0; i < _plot.spans.size(); ++i) {
        const std::string& text = _plot.spans[i].text;
        const auto state = std::ranges::find(states, text);
        const auto shade = (state - states.begin()) % 3;
        if (state == states.end())
            states.push_back(text);
        const QRectF span = shape.span(i);
        painter.fillRect(span, shade == 0 ? colours.selected() : shade == 1 ? colours.spread() : colours.pressed());
        painter.fillRect(QRectF(span.left(), span.top(), kThin, span.height()), colours.muted);
        const QRectF room = span.adjusted(4, 0, -2, 0);
        const QString shown = fontMetrics().elidedText(lineOf(text), Qt::ElideRight, static_cast<int>(room.width()));
        painter.setPen(colours.ink);
        if (shown.size() > 2) // a letter and "…" say nothing
            painter.drawText(room, Qt::AlignVCenter | Qt::AlignLeft, shown);
    }
}

void Plot::drawMarks(QPainter& painter) const
{
    const Colours& colours = coloursOf(*this);
    const QRectF within = place();
    const PlotShape shape(_plot, within);
    for (const auto& mark : _plot.marks) {
        const double x = shape.x(mark.at);
        painter.fillRect(QRectF(x, within.top(), kThin, within.height()), colours.line);
        painter.fillRect(QRectF(x - kThin, within.bottom() - kTick, 3 * kThin, kTick), colours.muted);
    }
    double end = within.right(); // of the room beside a mark: the next text's
    for (const auto& mark : _plot.marks | std::views::reverse) {
        if (mark.text.empty())
            continue;
        const QString text = lineOf(mark.text);
        const double x = shape.x(mark.at) + 2, width = fontMetrics().horizontalAdvance(text) + 4;
        if (x + width <= std::exchange(end, x - 2))
            drawOver(painter, {x, within.bottom() - lineHeight(), width, 1.0 * lineHeight()}, text, colours.surface,
                     colours.muted);
    }
}

void Plot::drawTexts(QPainter& painter) const
{
    const QRectF within = place();
    painter.setPen(coloursOf(*this).muted);
    const double high = lineHeight();
    for (std::size_t i = 0; i < _plot.numbers.size() && i < 3; ++i) {
        const double y = within.bottom() - high - static_cast<double>(i) * (within.height() - high) / 2;
        painter.drawText(QRectF(kInset, y, besideTheAxis() - kGap, high), Qt::AlignRight | Qt::AlignVCenter,
                         lineOf(_plot.numbers[i]));
    }
    constexpr Qt::Alignment kSides[] = {Qt::AlignLeft, Qt::AlignHCenter, Qt::AlignRight};
    for (std::size_t i = 0; i < _plot.times.size() && i < std::size(kSides); ++i)
        painter.drawText(QRectF(within.left(), within.bottom() + 4, within.width(), high), lineOf(_plot.times[i]),
                         QTextOption(kSides[i]));
}

void Plot::drawCursor(QPainter& painter) const
{
    const std::size_t entries = PlotShape::entries(_plot);
    if (entries == 0)
        return;
    const Colours& colours = coloursOf(*this);
    const QRectF within = place();
    const PlotShape shape(_plot, within);
    const std::size_t at = std::min(_plot.cursor.value_or(entries - 1), entries - 1);
    const double x = shape.xOf(at);
    if (!_plot.spans.empty()) {
        if (_plot.cursor)
            strokeRing(painter, shape.span(at), colours.ink);
        return;
    }
    if (_plot.cursor)
        painter.fillRect(QRectF(x - kThin / 2, within.top(), kThin, within.height()), colours.ink);
    if (const double value = _plot.points[at].mean; !std::isnan(value)) {
        painter.setPen(QPen(colours.surface, 1.5));
        painter.setBrush(_plot.cursor ? colours.ink : colours.accent);
        painter.drawEllipse(QPointF(x, shape.y(value)), kDot, kDot);
    }
}

// The events go on to the sheet, which a finger scrolls up and down here too.
void Plot::mousePressEvent(QMouseEvent* event)
{
    event->ignore();
    _isUpright = event->button() != Qt::LeftButton;
    _pressed = event->position();
    moveCursorTo(*event);
}

void Plot::mouseMoveEvent(QMouseEvent* event)
{
    event->ignore();
    const QPointF way = event->position() - _pressed;
    _isUpright = _isUpright || (std::abs(way.y()) > kDragStart && std::abs(way.y()) > std::abs(way.x()));
    moveCursorTo(*event);
}

void Plot::moveCursorTo(const QMouseEvent& event)
{
    const auto to = _isUpright ? std::nullopt : PlotShape(_plot, place()).nearest(event.position().x());
    if (to && to != _plot.cursor)
        _actions.moveCursor(to);
}

PlotView::PlotView(PlotActions actions, QWidget* parent)
    : QWidget(parent),
      _actions(std::move(actions)),
      _own{[this](std::optional<std::size_t> to) { moveCursor(to); }, [this](std::size_t to) { chooseRange(to); }},
      _reading(this),
      _drawing(_own, this),
      _choice(new QHBoxLayout)
{
    _reading.setFont(semiboldFont(kTextSize));
    _reading.setTextFormat(Qt::PlainText);
    _reading.setWordWrap(true);
    _reading.setContentsMargins(kInset, 0, kInset, 0);
    _reading.setFixedHeight(2 * _reading.fontMetrics().lineSpacing()); // so that the plot stands still
    _reading.setAlignment(Qt::AlignBottom | Qt::AlignLeft);
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(0);
    layout->addWidget(&_reading);
    layout->addWidget(&_drawing, 1);
    layout->addLayout(_choice);
}

void PlotView::setPlot(const SheetPlot& plot)
{
    if (plot == _drawing.plot())
        return;
    _drawing.setPlot(plot);
    _reading.setText(lineOf(plot.reading));
    setRanges(plot);
    if (!std::exchange(_isAsked, false))
        return; // every refresh changes the texts: a screen reader that told all of them would never be silent
    QAccessibleEvent alert(&_reading, QAccessible::Alert);
    QAccessible::updateAccessibility(&alert);
}

void PlotView::setRanges(const SheetPlot& plot)
{
    while (_ranges.size() > plot.ranges.size()) {
        delete _ranges.back();
        _ranges.pop_back();
    }
    while (_ranges.size() < plot.ranges.size()) {
        auto* button = new Button(Button::Kind::Plain, {}, this);
        button->setCheckable(true);
        button->setFocusPolicy(Qt::TabFocus); // after a touch the arrow keys stay the cursor's
        connect(button, &QAbstractButton::clicked, this, [this, range = _ranges.size()] { chooseRange(range); });
        _choice->addWidget(button);
        _ranges.push_back(button);
    }
    for (std::size_t i = 0; i < _ranges.size(); ++i) {
        _ranges[i]->setText(lineOf(plot.ranges[i]));
        _ranges[i]->setChecked(i == plot.range);
    }
}

void PlotView::moveCursor(std::optional<std::size_t> to)
{
    _isAsked = true;
    _actions.moveCursor(to);
}

void PlotView::chooseRange(std::size_t range)
{
    for (std::size_t i = 0; i < _ranges.size(); ++i) // the owner decides
        _ranges[i]->setChecked(i == _drawing.plot().range);
    _isAsked = true;
    _actions.chooseRange(range);
}

bool PlotView::handle(const QKeyEvent& event)
{
    const SheetPlot& plot = _drawing.plot();
    const std::size_t entries = PlotShape::entries(plot);
    const auto range = static_cast<std::size_t>(event.key() - Qt::Key_1);
    if (event.modifiers() & ~Qt::KeypadModifier)
        return false;
    if (event.key() >= Qt::Key_1 && range < plot.ranges.size()) {
        chooseRange(range);
        return true;
    }
    if (event.key() == Qt::Key_Escape && plot.cursor) {
        moveCursor(std::nullopt);
        return true;
    }
    if (entries == 0)
        return false;
    const std::size_t last = entries - 1, at = std::min(plot.cursor.value_or(last), last);
    switch (event.key()) {
    case Qt::Key_Left:
        moveCursor(at ? at - 1 : 0);
        return true;
    case Qt::Key_Right:
        moveCursor(std::min(at + 1, last));
        return true;
    case Qt::Key_Home:
        moveCursor(0);
        return true;
    case Qt::Key_End:
        moveCursor(last);
        return true;
    default:
        return false;
    }
}

} // namespace kestrum::qt
