#pragma once

#include "frontends/qt/Button.h"
#include "platform/NavigationView.h"

#include <QWidget>
#include <functional>
#include <optional>
#include <string>

namespace kestrum::qt {

/// The bar over the toolbar while the panes stand still: to other moments, and back to the modem.
class MomentBar final : public QWidget {
public:
    MomentBar(const std::function<void(Look)>& look, QWidget* parent);

    /// Hidden without a moment. A screen reader is told each new one.
    void setMoment(const std::optional<FrozenMoment>& moment);
    Button& earlier() { return _earlier; }
    Button& live() { return _live; }
    Button& later() { return _later; }

protected:
    void paintEvent(QPaintEvent*) override;
    void resizeEvent(QResizeEvent*) override;

private:
    Button _earlier, _live, _later;
    std::string _text;
};

} // namespace kestrum::qt
