#pragma once

#include "platform/View.h"

#include <memory>

namespace kestrum {

/// A view that scrolls sideways when its content is wider than its frame. A tap without scrolling goes to the row
/// below the view.
class ScrollView : public View {
public:
    virtual void addSubview(std::shared_ptr<View> view) = 0;
    virtual void setContentSize(Size size) = 0;
};

} // namespace kestrum
