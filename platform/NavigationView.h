#pragma once

#include <array>
#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

class SaveInterface;
class Sheet;
class SheetOwner;
class TableScreen;

/// What the user asks of the moment that is shown.
enum class Look {
    Freeze,  ///< the panes stand still; again: they follow the modem
    Earlier, ///< the refresh before; freezes first
    Later,
};

/// A screen that the user can open over the panes.
enum class SheetKind {
    Glance,   ///< the shown list as a table
    Overview, ///< the whole display in one look
    Trend,    ///< how the value of a row has been
    Meaning,  ///< what the key of a row means, and how good its value is
    Events,   ///< what happened
    Cells,    ///< the cells that have served
};

/// How the user opens a sheet.
struct SheetCommand {
    SheetKind kind;
    char key;
    std::string_view name;  ///< in a menu
    std::string_view brief; ///< beside the key
    bool isOfRow;           ///< of a row of the pane, not of the pane
};

inline constexpr std::array kSheetCommands = {
    SheetCommand{SheetKind::Glance, 'v', "Show as table", "table", false},
    SheetCommand{SheetKind::Overview, 'o', "Overview", "overview", false},
    SheetCommand{SheetKind::Trend, 't', "Trend", "trend", true},
    SheetCommand{SheetKind::Meaning, 'i', "What it means", "meaning", true},
    SheetCommand{SheetKind::Events, 'e', "Events", "events", false},
    SheetCommand{SheetKind::Cells, 'c', "Cells", "cells", false},
};

/// The key with which the user keeps the last 15 minutes as files.
inline constexpr char kKeepKey = 'K';

/// What a navigation view reports.
class NavigationViewDelegate {
public:
    virtual ~NavigationViewDelegate() = default;
    /// The user wants the pane before this one: the back button, Escape, a swipe.
    virtual void backRequested() = 0;
    /// Whether the shown pane has that sheet. A trend and a meaning are of a row of its table.
    virtual bool offers(SheetKind kind, std::optional<std::size_t> row) const = 0;
    virtual void sheetRequested(SheetKind kind, std::optional<std::size_t> row) = 0;
    virtual void lookRequested(Look look) = 0;
    /// The user wants the last 15 minutes as files.
    virtual void keepRequested() = 0;
};

/// The moment at which the panes stand still.
struct FrozenMoment {
    std::string text; ///< the moment that is shown, and since when the panes stand still
    bool hasEarlier, hasLater;
    friend bool operator==(const FrozenMoment&, const FrozenMoment&) = default;
};

enum class Transition { None, Push, Pop };

/// Shows the top of a stack of panes. It owns no pane: NavigationStack (ui/) owns them, and shows another pane before
/// it destroys the one that is shown.
class NavigationView {
public:
    virtual ~NavigationView() = default;

    /// Shows a pane. It takes input at once; the pane that leaves takes none, also while a transition is drawn.
    /// `titles` are those of the stack, root first, the shown pane last.
    virtual void show(TableScreen& pane, std::vector<std::string> titles, Transition transition, bool animated) = 0;
    /// The titles changed, the pane did not.
    virtual void setTitles(std::vector<std::string> titles) = 0;
    virtual void setToolbarHidden(bool hidden) = 0;
    /// Shows one line of text over every pane until another text replaces it; empty for none. The line takes no input.
    virtual void setNotice(std::string_view text) = 0;
    /// Offers the ways to other moments, and back. Nothing: the panes follow the modem, as they do at first.
    virtual void setFrozen(std::optional<FrozenMoment> moment) = 0;

    /// Shows a modal screen over the panes, and closes it. At most one is shown; `screen` is borrowed until then.
    virtual void present(SaveInterface& screen, bool animated) = 0;
    virtual void dismiss(bool animated) = 0;

    /// Opens an empty sheet over the panes; its end closes it. At most one is open, and no modal screen with it.
    virtual std::unique_ptr<Sheet> openSheet(SheetOwner& owner) = 0;
};

} // namespace kestrum
