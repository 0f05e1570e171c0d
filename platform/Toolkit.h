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

/// The UI toolkit: what the controllers of ui/ ask of a front end. Everything runs on the main thread. The roles that it
/// makes have a header each.
class Toolkit {
public:
    virtual ~Toolkit() = default;

    virtual Rect mainScreenBounds() const = 0;
    virtual Rect mainScreenApplicationFrame() const = 0; ///< less the status bar
    virtual Size measure(std::string_view text, Font font) const = 0;

    virtual std::unique_ptr<Window> makeWindow(Rect frame) = 0;
    virtual std::unique_ptr<NavigationView> makeNavigationView(NavigationViewDelegate& delegate) = 0;
    /// The controllers make these while they are being built: they are asked for nothing before the screen is shown.
    virtual std::unique_ptr<TableScreen> makeTableScreen(TableDataSource& source) = 0;
    virtual std::unique_ptr<SaveInterface> loadSaveInterface(SaveInterfaceOwner& owner) = 0;
    virtual std::shared_ptr<Label> makeLabel() = 0;
    virtual std::shared_ptr<ScrollView> makeScrollView() = 0;

    /// A message with a single button that closes it; one after the other when several are shown.
    virtual void showAlert(std::string_view title, std::string_view message, std::string_view button) = 0;

    /// Runs the main loop for the application until it is to end.
    virtual int run(ApplicationDelegate& application) = 0;
};

} // namespace kestrum
