#pragma once

#include <QObject>

namespace kestrum::qt {

/// Whether the ring around what has the keyboard is drawn. It belongs to the keyboard: a key that moves brings it, a
/// mouse button or a finger takes it away.
class FocusRing final : public QObject {
    Q_OBJECT

public:
    /// Made with the toolkit.
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
