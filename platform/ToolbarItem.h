#pragma once

#include "platform/Font.h"

#include <functional>
#include <string>
#include <variant>

namespace kestrum {

struct ActivityIndicatorItem { ///< small and grey; hidden when stopped
    bool running;
    friend bool operator==(const ActivityIndicatorItem&, const ActivityIndicatorItem&) = default;
};
struct LabelItem { ///< sized to fit its text, clear background, dark text
    std::string text;
    Font font;
    friend bool operator==(const LabelItem&, const LabelItem&) = default;
};
struct FlexibleSpaceItem {
    friend bool operator==(const FlexibleSpaceItem&, const FlexibleSpaceItem&) = default;
};
struct SaveItem { ///< the platform's standard Save button
    std::function<void()> action;
    /// Always equal: a button that the user holds down survives an update of the toolbar.
    friend bool operator==(const SaveItem&, const SaveItem&) { return true; }
};
using ToolbarItem = std::variant<ActivityIndicatorItem, LabelItem, FlexibleSpaceItem, SaveItem>;

} // namespace kestrum
