#pragma once

#include "platform/ScrollView.h"
#include "platform/TableView.h"
#include "platform/Toolkit.h"

#include <memory>
#include <optional>
#include <string_view>
#include <utility>

namespace kestrum {

/// A row of a pane: a bold key and, for a leaf, its value, in a strip that scrolls sideways.
class KestrumCell final : public ReusableCell {
public:
    /// A key-only cell, without value and strip.
    static std::shared_ptr<KestrumCell> initWithStyleKey(Toolkit& toolkit, TableView& table, CellStyle style,
                                                         std::string_view reuseIdentifier);
    /// A cell with key and value.
    static std::shared_ptr<KestrumCell> initWithStyle(Toolkit& toolkit, TableView& table, CellStyle style,
                                                      std::string_view reuseIdentifier);

    const std::shared_ptr<Label>& key() const { return _key; }
    void setKey(std::shared_ptr<Label> key) { _key = std::move(key); }
    /// Null in a key-only cell.
    const std::shared_ptr<Label>& value() const { return _value; }
    void setValue(std::shared_ptr<Label> value) { _value = std::move(value); }

    /// Sets the texts of the labels that the cell has.
    void setTexts(std::string_view key, std::optional<std::string_view> value);

    /// Lays out a row that opens another pane: the key.
    void setLayoutKey();
    /// Lays out a leaf: the value is at the right edge when both texts fit, else behind the key.
    void setLayout();

private:
    KestrumCell(Toolkit& toolkit, TableView& table, CellStyle style, std::string_view reuseIdentifier);

    Size measured(const Label* label) const;
    /// Places the key and returns the size of its text.
    Size placeKey(Rect bounds);

    Toolkit& _toolkit;
    std::shared_ptr<Label> _key;
    std::shared_ptr<Label> _value;
    std::shared_ptr<ScrollView> _view; ///< holds both labels; null in a key-only cell
};

} // namespace kestrum
