#pragma once

#include "platform/TableView.h"
#include "platform/ToolbarItem.h"

#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

/// The front end's side of a pane: a table filling the screen under a title, over a toolbar.
class TableScreen {
public:
    virtual ~TableScreen() = default;
    virtual TableView& table() = 0;
    virtual void setTitle(std::string_view title) = 0;
    virtual std::string title() const = 0;
    /// Left to right. An item equal to the one at its place stays the same object.
    virtual void setToolbarItems(std::vector<ToolbarItem> items, bool animated) = 0;
    virtual void resignFirstResponder() = 0;
    /// Lines that stand, in muted text, where the rows would be while there are none; empty for nothing.
    virtual void setHint(std::string_view text) = 0;
};

} // namespace kestrum
