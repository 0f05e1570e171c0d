#pragma once

#include <string_view>

namespace kestrum {

/// The operations of the application that its screens use. It outlives them.
class SharedApplication {
public:
    virtual ~SharedApplication() = default;

    /// Whether panes offer the Save button. Decided once, at launch.
    virtual bool allowSaveButton() const = 0;
    /// Presents the save screen, unless it is shown already.
    virtual void showSaveView() = 0;
    /// Dismisses and destroys the save screen. Does nothing when none is shown.
    virtual void closeSaveView() = 0;
    /// Shows one line of text for a few seconds.
    virtual void showNotice(std::string_view text) = 0;
};

} // namespace kestrum
