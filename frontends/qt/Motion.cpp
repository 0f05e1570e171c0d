#include "frontends/qt/Motion.h"

#include <QApplication>
#include <QPainter>
#include <QStyle>
#include <utility>

namespace kestrum::qt {

namespace {

constexpr char kReducedMotion[] = "kestrum.reducedMotion"; // a property of the application object

} // namespace

bool motionWanted()
{
    return QApplication::style()->styleHint(QStyle::SH_Widget_Animation_Duration) > 0 &&
           !qApp->property(kReducedMotion).toBool();
}

void setMotionWanted(bool wanted)
{
    qApp->setProperty(kReducedMotion, !wanted);
}

Still::Still(QWidget& of, QWidget* parent) : QWidget(parent), _picture(of.grab())
{
    setAttribute(Qt::WA_TransparentForMouseEvents);
    setGeometry(of.geometry());
}

void Still::paintEvent(QPaintEvent*)
{
    QPainter(this).drawPixmap(0, 0, _picture);
}

Movement::Movement()
{
    _animation.setStartValue(0.0);
    _animation.setEndValue(1.0);
    _animation.setEasingCurve(QEasingCurve::OutCubic);
    QObject::connect(&_animation, &QVariantAnimation::valueChanged, [this](const QVariant& value) {
        if (_step)
            _step(value.toDouble());
    });
    QObject::connect(&_animation, &QVariantAnimation::finished, [this] { finish(); });
}

void Movement::start(int milliseconds, std::function<void(double)> step, std::function<void()> end)
{
    finish();
    _step = std::move(step);
    _end = std::move(end);
    _step(0);
    _animation.setDuration(milliseconds);
    _animation.start();
}

void Movement::finish()
{
    const auto step = std::exchange(_step, nullptr);
    const auto end = std::exchange(_end, nullptr);
    _animation.stop();
    if (step)
        step(1);
    if (end)
        end();
}

} // namespace kestrum::qt
