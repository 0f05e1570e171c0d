#pragma once

#include "frontends/qt/Table.h"

#include <QMenu>

namespace kestrum::qt {

/// The actions for a row besides opening it. It closes when its table is covered or removed.
class ContextMenu final : public QMenu {
public:
    /// `at` is in screen coordinates. Without a row it offers the actions for the whole pane.
    ContextMenu(Table& table, std::optional<std::size_t> row, QPoint at);

    bool eventFilter(QObject* watched, QEvent* event) override;
};

} // namespace kestrum::qt
