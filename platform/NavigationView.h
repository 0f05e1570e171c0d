#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

class SaveInterface;
class TableScreen;

/// What a navigation view reports.
class NavigationViewDelegate {
public:
    virtual ~NavigationViewDelegate() = default;
    /// The user wants the pane before this one: the back button, Escape, a swipe.
    virtual void backRequested() = 0;
};

enum class Transition { None, Push, Pop };

/// Shows the top of a stack of panes. It owns none: the stack of ui/ keeps them, and shows another one before it
/// lets go of one that is shown.
class NavigationView {
public:
    virtual ~NavigationView() = default;

    /// The pane to show, at once as far as input goes: the transition only draws, and what leaves takes no input.
    /// `titles` are the stack's, root first, the shown pane's last.
    virtual void show(TableScreen& pane, std::vector<std::string> titles, Transition transition, bool animated) = 0;
    /// The titles changed, the pane did not.
    virtual void setTitles(std::vector<std::string> titles) = 0;
    virtual void setToolbarHidden(bool hidden) = 0;
    /// One line that says what was done, over whichever pane is shown, until another text replaces it; empty for
    /// none. It takes no input.
    virtual void setNotice(std::string_view text) = 0;

    /// A modal screen over the panes, and its end. At most one.
    virtual void present(SaveInterface& screen, bool animated) = 0;
    virtual void dismiss(bool animated) = 0;
};

} // namespace kestrum
