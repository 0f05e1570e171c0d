#pragma once

#include "platform/Font.h"
#include "platform/View.h"

#include <optional>
#include <string_view>

namespace kestrum {

/// One line of text, left-aligned in its frame.
class Label : public View {
public:
    virtual void setText(std::optional<std::string_view> text) = 0; ///< UTF-8; without a text the label is empty
    virtual std::optional<std::string> text() const = 0;
    virtual void setFont(Font font) = 0;
    virtual Font font() const = 0;
};

} // namespace kestrum
