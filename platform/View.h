#pragma once

#include "platform/Geometry.h"

namespace kestrum {

/// A part of the screen, drawn inside another view. The view that holds it shares its ownership.
class View {
public:
    virtual ~View() = default;
    virtual void setFrame(Rect frame) = 0; ///< in the coordinates of the view that holds it
    virtual Rect frame() const = 0;
};

} // namespace kestrum
