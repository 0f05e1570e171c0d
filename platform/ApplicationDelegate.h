#pragma once

namespace kestrum {

/// The application object, as the main loop sees it.
class ApplicationDelegate {
public:
    virtual ~ApplicationDelegate() = default;
    virtual void applicationDidFinishLaunching() = 0;
    virtual void applicationWillTerminate() = 0; ///< exactly once, whatever ends the program
};

} // namespace kestrum
