#pragma once

#include "platform/Label.h"

#include <memory>

namespace kestrum {

/// The symbol at a row's right edge: none, "opens another pane", "marked".
enum class Accessory { None, DisclosureIndicator, CheckMark };

/// Default: the cell has a text label. KeyAndDetail: title left, detail right; the controller adds labels for both to
/// the content area.
enum class CellStyle { Default, KeyAndDetail };

/// One row of a table, drawn by the front end.
class TableCell {
public:
    virtual ~TableCell() = default;
    virtual Rect contentBounds() const = 0; ///< the row without its accessory; its origin is (0, 0)
    virtual void layoutSubviews() = 0;      ///< updates contentBounds
    virtual void setAccessory(Accessory accessory) = 0;
    virtual void addSubview(std::shared_ptr<View> view) = 0; ///< to the content area
    virtual Label& textLabel() = 0;                          ///< the default style's own label
};

} // namespace kestrum
