#pragma once

#include "frontends/terminal/EditedLine.h"
#include "frontends/terminal/Repaint.h"
#include "frontends/terminal/SaveScreen.h"
#include "frontends/terminal/Screen.h"
#include "frontends/terminal/SheetScreen.h"
#include "frontends/terminal/Table.h"
#include "platform/NavigationView.h"
#include "platform/SaveInterface.h"
#include "platform/TableScreen.h"

#include <cstddef>
#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum::terminal {

/// A pane: rows, and the contents of the bottom line.
class TerminalTableScreen final : public TableScreen {
public:
    TerminalTableScreen(TableDataSource& source, Repaint& repaint) : _table(source, repaint), _repaint(repaint) {}

    TerminalTable& table() override { return _table; }
    const TerminalTable& table() const { return _table; }
    void setTitle(std::string_view title) override { _title = title; }
    std::string title() const override { return _title; }
    void setToolbarItems(std::vector<ToolbarItem> items, bool animated) override;
    void resignFirstResponder() override {} // a pane has no text field
    void setHint(std::string_view text) override;

    bool isSpinning() const;
    std::string status() const;
    const SaveItem* saveItem() const;
    const std::string& hint() const { return _hint; }

private:
    TerminalTable _table;
    Repaint& _repaint;
    std::string _title, _hint;
    std::vector<ToolbarItem> _items;
};

/// The whole screen: the path in the title line, the pane's rows, the toolbar in the bottom line. The save screen,
/// the help or the search field is drawn over them.
class TerminalNavigationView final : public NavigationView {
public:
    TerminalNavigationView(NavigationViewDelegate& delegate, Repaint& repaint, std::function<void()> quit)
        : _delegate(delegate), _repaint(repaint), _quit(std::move(quit))
    {}

    void show(TableScreen& pane, std::vector<std::string> titles, Transition transition, bool animated) override;
    void setTitles(std::vector<std::string> titles) override;
    void setToolbarHidden(bool hidden) override;
    void setNotice(std::string_view text) override;
    void setFrozen(std::optional<FrozenMoment> moment) override;
    void present(SaveInterface& screen, bool animated) override;
    void dismiss(bool animated) override;
    std::unique_ptr<Sheet> openSheet(SheetOwner& owner) override;

    /// `spinner` is the current picture of the activity indicator. `inBackground`: another part takes the input.
    void draw(Screen& screen, std::string_view spinner, bool inBackground);
    void handle(const Input& input);
    bool isSpinning() const { return _pane && _pane->isSpinning(); }

private:
    /// A key that the bottom line names, and its position for the mouse.
    struct Hint {
        wchar_t key;
        std::string text;
        int column = 0;
    };

    void handleHelp(const Input& input);
    void handleJump(const Input& input);
    void handlePane(const Input& input);
    void handleCommand(wchar_t key);
    std::optional<std::size_t> rowFor(const SheetCommand& command) const;
    void openSheetOf(wchar_t key);
    void drawHint(Screen& screen, Area area) const;
    void drawTitle(const Line& line) const;
    void drawToolbar(const Line& line, std::string_view spinner);
    void drawHelp(Screen& screen);

    NavigationViewDelegate& _delegate;
    Repaint& _repaint;
    std::function<void()> _quit;
    TerminalTableScreen* _pane = nullptr;
    TerminalSaveInterface* _save = nullptr;
    TerminalSheet* _sheet = nullptr;
    std::vector<std::string> _titles;
    std::string _notice;
    std::optional<FrozenMoment> _frozen;
    bool _toolbarHidden = false;
    std::optional<int> _help; // while it is shown: its first line
    int _nextHelp = 0;        // the first line without room, as drawn last; 0 for none
    wchar_t _asked = L'\0';   // the key of the sheet that is about to open
    std::vector<Hint> _hints;
    int _bottom = 0; // the toolbar's line

    /// The search for a row while the user types its name.
    struct Jump {
        EditedLine name;
        TerminalTable::Place from; // the row that was chosen before
        bool found = true;
    };
    std::optional<Jump> _jump;
    std::string _lastJump;
};

} // namespace kestrum::terminal
