#pragma once

namespace kestrum {

/// What the main loop calls on the application object.
class ApplicationDelegate {
public:
    virtual ~ApplicationDelegate() = default;
    virtual void applicationDidFinishLaunching() = 0;
    virtual void applicationWillTerminate() = 0; ///< exactly once, however the program ends
};

} // namespace kestrum
