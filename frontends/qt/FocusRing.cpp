#include "frontends/qt/FocusRing.h"

#include <QCoreApplication>
#include <QKeyEvent>

namespace kestrum::qt {

namespace {

/// Whether the key moves the focus. Keys that a handset has beside its screen are not included.
bool moves(const QKeyEvent& event)
{
    switch (event.key()) {
    case Qt::Key_Up:
    case Qt::Key_Down:
    case Qt::Key_Left:
    case Qt::Key_Right:
    case Qt::Key_PageUp:
    case Qt::Key_PageDown:
    case Qt::Key_Home:
    case Qt::Key_End:
    case Qt::Key_Tab:
    case Qt::Key_Backtab:
    case Qt::Key_Return:
    case Qt::Key_Enter:
    case Qt::Key_Space:
    case Qt::Key_Select:
    case Qt::Key_Escape:
    case Qt::Key_Backspace:
        return true;
    default:
        return false;
    }
}

} // namespace

FocusRing::FocusRing()
{
    QCoreApplication::instance()->installEventFilter(this);
}

FocusRing& FocusRing::instance()
{
    static FocusRing ring;
    return ring;
}

void FocusRing::setShown(bool shown)
{
    if (shown == _shown)
        return;
    _shown = shown;
    Q_EMIT changed();
}

bool FocusRing::eventFilter(QObject*, QEvent* event)
{
    switch (event->type()) {
    case QEvent::KeyPress:
        if (moves(static_cast<const QKeyEvent&>(*event)))
            setShown(true);
        break;
    case QEvent::MouseButtonPress:
    case QEvent::TouchBegin:
    case QEvent::TabletPress:
        setShown(false);
        break;
    default:
        break;
    }
    return false;
}

} // namespace kestrum::qt
