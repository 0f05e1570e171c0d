#pragma once

#include <QPixmap>
#include <QVariantAnimation>
#include <QWidget>
#include <functional>

namespace kestrum::qt {

/// False where the desktop asks for reduced motion: panes then change at once.
bool motionWanted();
void setMotionWanted(bool wanted);

/// A picture of what leaves: it moves out of sight in place of the real thing, and takes no input.
class Still final : public QWidget {
public:
    Still(QWidget& of, QWidget* parent);

protected:
    void paintEvent(QPaintEvent*) override;

private:
    QPixmap _picture;
};

/// One movement at a time, eased out. `step` gets 0 to 1, the 1 for sure; a movement that another one replaces is
/// brought to its end first.
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
