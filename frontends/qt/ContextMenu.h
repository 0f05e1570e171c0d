#pragma once

#include "frontends/qt/Table.h"

#include <QMenu>

namespace kestrum::qt {

/// What can be done with a row besides opening it. It closes when its table is covered or leaves.
class ContextMenu final : public QMenu {
public:
    /// At a point of the screen. Without a row: what can be done with the pane.
    ContextMenu(Table& table, std::optional<std::size_t> row, QPoint at);

    bool eventFilter(QObject* watched, QEvent* event) override;
};

} // namespace kestrum::qt
