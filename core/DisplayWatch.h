#pragma once

namespace kestrum {

class Dictionary;

/// Follows the displays of a model, in the order in which they are shown.
class DisplayWatch {
public:
    virtual ~DisplayWatch() = default;

    /// A new display was made. `entry` is its entry of the history (StateKey): valid during the call, and its
    /// containers change with the next message.
    virtual void displayMade(const Dictionary& entry) = 0;
};

} // namespace kestrum
