#pragma once

#include "frontends/terminal/EditedLine.h"
#include "frontends/terminal/Repaint.h"
#include "frontends/terminal/Screen.h"
#include "frontends/terminal/Table.h"
#include "platform/SaveInterface.h"

#include <functional>
#include <optional>
#include <string>

namespace kestrum::terminal {

/// The field of the save screen.
class TerminalTextField final : public TextField {
public:
    TerminalTextField(std::function<void()> resigned) : _resigned(std::move(resigned)) {}

    std::optional<std::string> text() const override { return _line.text(); }
    void resignFirstResponder() override { _resigned(); }

    bool handle(const Input& input) { return _line.handle(input); }
    /// Draws the field and returns the cursor's column within the line.
    int draw(const Line& line, bool focused) const;

private:
    EditedLine _line;
    std::function<void()> _resigned;
};

/// The save screen: the description, the list of what is saved, Save and Cancel. Tab and the arrow keys move between
/// them.
class TerminalSaveInterface final : public SaveInterface {
public:
    TerminalSaveInterface(SaveInterfaceOwner& owner, Repaint& repaint);

    TableView& saveContentTable() override { return _table; }
    TextField& saveDescription() override { return _description; }
    void setFrame(Rect) override {} // it always has the whole screen

    void draw(Screen& screen);
    void handle(const Input& input);

private:
    enum class Focus { Description, Table, Save, Cancel };

    void handleDescription(const Input& input);
    void handleTable(const Input& input);
    void handleButton(const Input& input);
    void press(const Input& input);
    void focus(Focus focus);
    void drawButton(const Line& line, Area& place, std::string_view text, Focus focus) const;

    SaveInterfaceOwner& _owner;
    Repaint& _repaint;
    TerminalTable _table;
    TerminalTextField _description;
    Focus _focus = Focus::Description;
    Area _descriptionArea, _saveArea, _cancelArea, _tableArea; // as drawn last, for the mouse
};

} // namespace kestrum::terminal
