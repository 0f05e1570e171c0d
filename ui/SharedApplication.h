#pragma once

#include <string_view>

namespace kestrum {

/// The application object, as its screens see it. It outlives them.
class SharedApplication {
public:
    virtual ~SharedApplication() = default;

    /// Whether panes offer the Save button. Decided once, at launch.
    virtual bool allowSaveButton() const = 0;
    /// Presents the save screen, unless it is shown already.
    virtual void showSaveView() = 0;
    /// Dismisses the save screen and lets go of it; nothing when none is shown.
    virtual void closeSaveView() = 0;
    /// Shows a line about what was done; it goes away by itself.
    virtual void showNotice(std::string_view text) = 0;
};

} // namespace kestrum
