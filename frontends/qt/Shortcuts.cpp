#include "frontends/qt/Shortcuts.h"

#include <QShortcut>
#include <QWidget>

namespace kestrum::qt {

void installShortcuts(QWidget& window)
{
    for (const auto key : {Qt::Key_Q, Qt::Key_W})
        QObject::connect(new QShortcut(QKeySequence(Qt::CTRL | key), &window), &QShortcut::activated, &window,
                         &QWidget::close);
    auto* const whole = new QShortcut(QKeySequence(Qt::Key_F11), &window);
    whole->setAutoRepeat(false);
    QObject::connect(whole, &QShortcut::activated, &window,
                     [&window] { window.setWindowState(window.windowState() ^ Qt::WindowFullScreen); });
}

} // namespace kestrum::qt
