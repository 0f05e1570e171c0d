#pragma once

#include "insight/Glance.h"
#include "insight/Overview.h"
#include "platform/NavigationView.h"
#include "platform/Sheet.h"

#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <variant>

namespace kestrum {

/// The sheets over the panes: at most one is open. They read the tree that the panes show.
class Sheets final : private SheetOwner {
public:
    Sheets(NavigationView& view, Thresholds thresholds) : _view(view), _thresholds(std::move(thresholds)) {}

    /// Whether the pane of that node has the sheet. `node` may be null.
    bool offers(SheetKind kind, std::string_view technology, std::string_view path,
                const KestrumModelNodeRef& node) const;
    /// Opens the sheet, for the pane of that path. Empty until `refresh` and `show`.
    void open(SheetKind kind, std::string_view technology, std::string_view path);
    /// A newer tree, or null for none. Closes a sheet of another technology, or of a list that is gone.
    void refresh(std::string_view technology, const KestrumModelNodeRef& root);
    void show(std::string_view status);
    void close();

private:
    void sheetLeft() override { close(); }
    void columnChosen(std::size_t column) override;
    void cursorMoved(std::optional<std::size_t>) override {}
    void rangeChosen(std::size_t) override {}
    void takeGlance(const Glance& glance);

    NavigationView& _view;
    const Thresholds _thresholds;
    std::unique_ptr<Sheet> _sheet;
    std::variant<std::monostate, Glance, Overview> _source;
    std::string _technology;
    SheetContents _contents;
};

} // namespace kestrum
