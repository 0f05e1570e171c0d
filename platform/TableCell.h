#pragma once

#include "platform/Label.h"

#include <memory>

namespace kestrum {

/// Whether a row opens something, or is marked.
enum class Accessory { None, DisclosureIndicator, CheckMark };

/// Default: the cell draws its own text label. KeyAndDetail: title left, detail right, here drawn by labels that
/// are added to the content area.
enum class CellStyle { Default, KeyAndDetail };

/// One row as the front end draws it.
class TableCell {
public:
    virtual ~TableCell() = default;
    virtual Rect contentBounds() const = 0; ///< the content area: the row less its accessory; its origin is (0, 0)
    virtual void layoutSubviews() = 0;      ///< the cell's own layout: brings contentBounds up to date
    virtual void setAccessory(Accessory accessory) = 0;
    virtual void addSubview(std::shared_ptr<View> view) = 0; ///< to the content area
    virtual Label& textLabel() = 0;                          ///< the default style's own label
};

} // namespace kestrum
