#include "frontends/qt/Icon.h"

#include <QPixmap>

// At file scope, as Qt requires. Without this call the linker drops the resources of a static library.
static void registerPictures()
{
    Q_INIT_RESOURCE(kestrum);
}

namespace kestrum::qt {

QIcon windowIcon()
{
    const QIcon drawn = drawnIcon();
    return QIcon::fromTheme(QStringLiteral("kestrum"), drawn.isNull() ? paintedIcon() : drawn);
}

QIcon drawnIcon()
{
    registerPictures();
    const QIcon icon(QStringLiteral(":/kestrum.svg"));
    return icon.pixmap(16).isNull() ? QIcon() : icon;
}

QIcon paintedIcon()
{
    registerPictures();
    QIcon icon;
    for (const int size : {16, 22, 24, 32, 48, 64, 128, 256})
        icon.addFile(QStringLiteral(":/icons/%1.png").arg(size), {size, size});
    return icon;
}

} // namespace kestrum::qt
