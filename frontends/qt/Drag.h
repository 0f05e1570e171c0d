#pragma once

#include <QObject>
#include <QPointF>
#include <QScroller>

#include <optional>

class QAbstractScrollArea;
class QMouseEvent;
class QWidget;

namespace kestrum::qt {

/// Points; a finger moves less than this during a tap.
inline constexpr double kDragStart = 8;

/// Passes a finger's event on to the scroller of `target`, as if it were at `at`.
void feed(QObject& target, QScroller::Input input, const QMouseEvent& event, QPointF at);

/// The scroller of `target` neither waits for a drag's start nor moves beyond the ends.
void setUpScroller(QObject& target);

/// Lets a finger scroll a view of Qt's. A press without a drag stays the view's. Qt's own gesture for this leaks memory.
class DragScroll final : public QObject {
public:
    /// `outer` moves up and down instead of an `area` that is as high as its contents.
    explicit DragScroll(QAbstractScrollArea& area, QAbstractScrollArea* outer = nullptr);

    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    QWidget& viewportFor(QPointF way) const;

    QAbstractScrollArea& _area;
    QAbstractScrollArea* _outer;
    std::optional<QPointF> _pressed; ///< on the screen, as a view may move under the finger
    QWidget* _moved = nullptr;       ///< the viewport that the drag moves
};

} // namespace kestrum::qt
