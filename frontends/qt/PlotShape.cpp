#include "frontends/qt/PlotShape.h"

#include <algorithm>
#include <cmath>
#include <ranges>
#include <span>

namespace kestrum::qt {

double PlotShape::y(double number) const
{
    const double part = (std::clamp(number, _plot.bottom, _plot.top) - _plot.bottom) / (_plot.top - _plot.bottom);
    return _place.bottom() - part * _place.height();
}

double PlotShape::xOf(std::size_t entry) const
{
    return _plot.spans.empty() ? x(_plot.points[entry].at) : span(entry).center().x();
}

template <typename Take>
void PlotShape::eachRun(Take take) const
{
    const auto isGap = [](const SheetPlot::Point& point) { return std::isnan(point.mean); };
    const auto end = _plot.points.end();
    for (auto from = std::ranges::find_if_not(_plot.points, isGap); from != end;) {
        const auto to = std::find_if(from, end, isGap);
        take(std::span(from, to));
        from = std::find_if_not(to, end, isGap);
    }
}

std::vector<QPolygonF> PlotShape::lines() const
{
    std::vector<QPolygonF> lines;
    eachRun([&](std::span<const SheetPlot::Point> run) {
        QPolygonF& line = lines.emplace_back();
        for (const auto& point : run)
            line << QPointF(x(point.at), y(point.mean));
    });
    return lines;
}

std::vector<QPolygonF> PlotShape::spreads() const
{
    std::vector<QPolygonF> spreads;
    eachRun([&](std::span<const SheetPlot::Point> run) {
        if (std::ranges::all_of(run, [](const auto& point) { return point.least == point.greatest; }))
            return;
        // A point that is alone is as wide as a line.
        const double beside = run.size() == 1 ? 1 : 0;
        QPolygonF& spread = spreads.emplace_back();
        spread << QPointF(x(run.front().at) - beside, y(run.front().greatest));
        for (const auto& point : run)
            spread << QPointF(x(point.at) + beside, y(point.greatest));
        for (const auto& point : run | std::views::reverse)
            spread << QPointF(x(point.at) + beside, y(point.least));
        spread << QPointF(x(run.front().at) - beside, y(run.front().least));
    });
    return spreads;
}

QRectF PlotShape::band(std::size_t index) const
{
    const bool isLast = index + 1 == _plot.bands.size();
    const double top = y(isLast ? _plot.top : _plot.bands[index + 1].least), bottom = y(_plot.bands[index].least);
    return {QPointF(_place.left(), top), QPointF(_place.right(), bottom)};
}

QRectF PlotShape::span(std::size_t index) const
{
    const auto& span = _plot.spans[index];
    return {QPointF(x(span.from), _place.top()), QPointF(x(span.to), _place.bottom())};
}

std::optional<std::size_t> PlotShape::nearest(double at) const
{
    std::optional<std::size_t> nearest;
    double least = 0;
    for (std::size_t i = 0; i < entries(_plot); ++i) {
        const QRectF reach = _plot.spans.empty() ? QRectF(xOf(i), 0, 0, 0) : span(i);
        const double away = std::max({reach.left() - at, at - reach.right(), 0.0});
        if (!nearest || away < least) {
            nearest = i;
            least = away;
        }
    }
    return nearest;
}

} // namespace kestrum::qt
