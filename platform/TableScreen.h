#pragma once

#include "platform/TableView.h"
#include "platform/ToolbarItem.h"

#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

/// A pane as the front end draws it: title, table and toolbar.
class TableScreen {
public:
    virtual ~TableScreen() = default;
    virtual TableView& table() = 0;
    virtual void setTitle(std::string_view title) = 0;
    virtual std::string title() const = 0;
    /// Items from left to right. An item that equals the old one at the same place keeps its object.
    virtual void setToolbarItems(std::vector<ToolbarItem> items, bool animated) = 0;
    virtual void resignFirstResponder() = 0;
    /// The text, in a muted colour, of a table without rows; lines are separated by "\n". Empty for none.
    virtual void setHint(std::string_view text) = 0;
};

} // namespace kestrum
