#pragma once

#include "frontends/qt/Table.h"
#include "frontends/qt/Toolbar.h"
#include "frontends/qt/Type.h"
#include "platform/TableScreen.h"

namespace kestrum::qt {

/// A pane: a table and the toolbar under it. The navigation view shows both while the pane is on top.
class Screen final : public TableScreen {
public:
    explicit Screen(TableDataSource& source) : _table(source) { _table.hide(); }

    Table& table() override { return _table; }
    void setTitle(std::string_view title) override
    {
        _title = title;
        _table.setAccessibleName(lineOf(title));
    }
    std::string title() const override { return _title; }
    void setToolbarItems(std::vector<ToolbarItem> items, bool) override { _toolbar.setItems(std::move(items)); }
    void resignFirstResponder() override { _table.clearFocus(); }
    void setHint(std::string_view text) override { _table.setHint(text); }

    Toolbar& toolbar() { return _toolbar; }

private:
    Table _table;
    Toolbar _toolbar;
    std::string _title;
};

} // namespace kestrum::qt
