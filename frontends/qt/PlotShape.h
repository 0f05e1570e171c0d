#pragma once

#include "platform/Sheet.h"

#include <QPolygonF>
#include <QRectF>

#include <cstddef>
#include <optional>
#include <vector>

namespace kestrum::qt {

/// Where the parts of a plot stand in a rectangle.
class PlotShape {
public:
    PlotShape(const SheetPlot& plot, const QRectF& place) : _plot(plot), _place(place) {}

    double x(double at) const { return _place.left() + at * _place.width(); }
    /// A number beyond the axis stands at its end.
    double y(double number) const;
    /// Of a point or a span: its middle.
    double xOf(std::size_t entry) const;

    /// The means: one line between two gaps.
    std::vector<QPolygonF> lines() const;
    /// From the least to the greatest number of each point, where a line's points have them.
    std::vector<QPolygonF> spreads() const;
    /// The band's part of the axis; empty beyond it.
    QRectF band(std::size_t index) const;
    QRectF span(std::size_t index) const;

    /// How many points or spans there are for the cursor.
    static std::size_t entries(const SheetPlot& plot)
    {
        return plot.spans.empty() ? plot.points.size() : plot.spans.size();
    }
    /// The point or span under a finger.
    std::optional<std::size_t> nearest(double x) const;

private:
    template <typename Take>
    void eachRun(Take take) const;

    const SheetPlot& _plot;
    QRectF _place;
};

} // namespace kestrum::qt
