#pragma once

namespace kestrum {

class NavigationView;

/// The application's only window.
class Window {
public:
    virtual ~Window() = default;
    virtual void setRoot(NavigationView& root) = 0;
    virtual void makeKeyAndVisible() = 0;
    virtual void orderOut() = 0;
};

} // namespace kestrum
