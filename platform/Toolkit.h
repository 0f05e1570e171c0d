#pragma once

#include "platform/Font.h"
#include "platform/Geometry.h"

#include <memory>
#include <string_view>

namespace kestrum {

class ApplicationDelegate;
class Label;
class NavigationView;
class NavigationViewDelegate;
class SaveInterface;
class SaveInterfaceOwner;
class ScrollView;
class TableDataSource;
class TableScreen;
class Window;

/// The UI toolkit: the operations of a front end that the controllers of ui/ use. Main thread only. Each role that it
/// creates has its header.
class Toolkit {
public:
    virtual ~Toolkit() = default;

    virtual Rect mainScreenBounds() const = 0;
    virtual Rect mainScreenApplicationFrame() const = 0; ///< without the status bar
    virtual Size measure(std::string_view text, Font font) const = 0;

    virtual std::unique_ptr<Window> makeWindow(Rect frame) = 0;
    virtual std::unique_ptr<NavigationView> makeNavigationView(NavigationViewDelegate& delegate) = 0;
    /// Controllers call these two in their constructors. The screen calls its source or owner only after it is shown.
    virtual std::unique_ptr<TableScreen> makeTableScreen(TableDataSource& source) = 0;
    virtual std::unique_ptr<SaveInterface> loadSaveInterface(SaveInterfaceOwner& owner) = 0;
    virtual std::shared_ptr<Label> makeLabel() = 0;
    virtual std::shared_ptr<ScrollView> makeScrollView() = 0;

    /// Shows a message with one button that closes it. Several messages are shown one after the other.
    virtual void showAlert(std::string_view title, std::string_view message, std::string_view button) = 0;

    /// Runs the main loop until the application ends. Gives the exit status.
    virtual int run(ApplicationDelegate& application) = 0;
};

} // namespace kestrum
