#pragma once

#include <QPixmap>
#include <QVariantAnimation>
#include <QWidget>
#include <functional>

namespace kestrum::qt {

/// False where the desktop is set to reduced motion: panes then change at once.
bool motionWanted();
void setMotionWanted(bool wanted);

/// A picture of a removed widget. It moves out of sight in the widget's place, and handles no input.
class Still final : public QWidget {
public:
    Still(QWidget& of, QWidget* parent);

protected:
    void paintEvent(QPaintEvent*) override;

private:
    QPixmap _picture;
};

/// At most one animation at a time, eased out. `step` gets values from 0 to 1, and always the final 1. An animation
/// that is replaced is finished first.
class Movement final {
public:
    Movement();
    ~Movement() { finish(); }
    void start(
        int milliseconds, std::function<void(double)> step, std::function<void()> end = [] {});
    void finish();
    bool isRunning() const { return _animation.state() == QAbstractAnimation::Running; }

private:
    QVariantAnimation _animation;
    std::function<void(double)> _step;
    std::function<void()> _end;
};

} // namespace kestrum::qt
