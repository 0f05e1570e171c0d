#pragma once

#include <QObject>

namespace kestrum::qt {

/// Whether the ring around the focused widget is drawn. A key that moves the focus shows the ring; a mouse button or
/// a touch hides it.
class FocusRing final : public QObject {
    Q_OBJECT

public:
    /// Created together with the toolkit.
    static FocusRing& instance();

    bool isShown() const { return _shown; }
    void setShown(bool shown);

    bool eventFilter(QObject* watched, QEvent* event) override;

Q_SIGNALS:
    void changed();

private:
    FocusRing();

    bool _shown = false;
};

} // namespace kestrum::qt
