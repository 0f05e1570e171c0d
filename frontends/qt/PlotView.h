#pragma once

#include "frontends/qt/Button.h"
#include "platform/Sheet.h"

#include <QLabel>
#include <QWidget>

#include <functional>
#include <optional>
#include <vector>

class QHBoxLayout;
class QPainter;

namespace kestrum::qt {

/// What the user does with a plot.
struct PlotActions {
    std::function<void(std::optional<std::size_t>)> moveCursor;
    std::function<void(std::size_t)> chooseRange;
};

/// The drawing alone: a curve or a strip of states, with its axes and the cursor. A finger moves the cursor.
class Plot final : public QWidget {
public:
    Plot(const PlotActions& actions, QWidget* parent);
    void setPlot(const SheetPlot& plot);
    const SheetPlot& plot() const { return _plot; }

    /// Where the curve or the strip is, without its texts.
    QRectF place() const;
    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;

protected:
    void paintEvent(QPaintEvent*) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;

private:
    bool isStrip() const { return _plot.numbers.empty(); }
    int lineHeight() const { return fontMetrics().height(); }
    int besideTheAxis() const;
    void moveCursorTo(const QMouseEvent& event);
    void drawGround(QPainter& painter) const;
    void drawCurve(QPainter& painter) const;
    void drawStrip(QPainter& painter) const;
    void drawMarks(QPainter& painter) const;
    void drawWords(QPainter& painter) const;
    void drawTexts(QPainter& painter) const;
    void drawCursor(QPainter& painter) const;

    const PlotActions& _actions;
    SheetPlot _plot;
    QPointF _pressed;
    bool _isUpright = false; ///< the finger scrolls the sheet
};

/// A plot under what it reads at its cursor, over the times that it can show.
class PlotView final : public QWidget {
public:
    PlotView(PlotActions actions, QWidget* parent);
    void setPlot(const SheetPlot& plot);
    /// False for a key that is not the plot's.
    bool handle(const QKeyEvent& event);

    Plot& drawing() { return _drawing; }
    const QLabel& reading() const { return _reading; }
    const std::vector<Button*>& ranges() const { return _ranges; }

private:
    void setRanges(const SheetPlot& plot);
    void moveCursor(std::optional<std::size_t> to);
    void chooseRange(std::size_t range);

    PlotActions _actions, _own; ///< those of the sheet, and those that also tell a screen reader
    QLabel _reading;
    Plot _drawing;
    QHBoxLayout* _choice;
    std::vector<Button*> _ranges;
    bool _isAsked = false; ///< by the user, since the last contents
};

} // namespace kestrum::qt
