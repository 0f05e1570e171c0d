#pragma once

namespace kestrum::terminal {

/// Whoever shows something else than before asks for the screen to be drawn anew.
class Repaint {
public:
    virtual ~Repaint() = default;
    /// Draws everything once, when the main loop comes round to it, however often it was asked.
    virtual void repaintLater() = 0;
};

} // namespace kestrum::terminal
