#pragma once

namespace kestrum::terminal {

/// Requests a redraw of the screen. Call it after a change to what is shown.
class Repaint {
public:
    virtual ~Repaint() = default;
    /// Draws everything in the next round of the main loop, once however many requests were made.
    virtual void repaintLater() = 0;
};

} // namespace kestrum::terminal
