#pragma once

#include "platform/Geometry.h"

namespace kestrum {

/// Something that is drawn inside another view. Views that hold it keep it.
class View {
public:
    virtual ~View() = default;
    virtual void setFrame(Rect frame) = 0; ///< in the coordinates of the view that holds it
    virtual Rect frame() const = 0;
};

} // namespace kestrum
