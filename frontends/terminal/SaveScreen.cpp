#include "frontends/terminal/SaveScreen.h"

#include <algorithm>
#include <string_view>

namespace kestrum::terminal {

namespace {

constexpr int kFieldRow = 3, kTableRow = 5, kRowsBelow = 4; // lines

} // namespace

int TerminalTextField::draw(const Line& line, bool focused) const
{
    line.fill({.underlined = true});
    if (_line.isEmpty() && !focused) {
        line.put(0, kDescriptionPlaceholder, {.dim = true, .underlined = true});
        return 0;
    }
    // Shows as much text before the cursor as fits.
    const int cursor = columns(_line.beforeCursor());
    const int scrolled = std::max(0, cursor - line.width() + 1);
    const auto text = line.part(0, line.width(), scrolled);
    const int end = text.put(0, _line.text(), {.underlined = true});
    text.markCut(scrolled > 0, end - scrolled > line.width());
    return cursor - scrolled;
}

TerminalSaveInterface::TerminalSaveInterface(SaveInterfaceOwner& owner, Repaint& repaint)
    : _owner(owner), _repaint(repaint), _table(owner, repaint), _description([this] {
          // A touch screen closes its keyboard here. On a terminal the focus moves to the next control.
          if (_focus == Focus::Description)
              focus(Focus::Save);
      })
{}

void TerminalSaveInterface::focus(Focus focus)
{
    _focus = focus;
    _repaint.repaintLater();
}

void TerminalSaveInterface::draw(Screen& screen)
{
    const int rows = screen.rows(), columns = std::min(screen.columns(), kColumn),
              inner = std::max(0, columns - 2 * kInset);
    const Line title(screen, 0, 0, columns);
    title.put(kInset, "Save Snapshot", {.bold = true});
    Line(screen, kFieldRow - 1, 0, columns).put(kInset, "Description", {.dim = _focus != Focus::Description});

    _descriptionArea = {kFieldRow, kInset, 1, inner};
    const Line field(screen, kFieldRow, kInset, inner);
    const int cursor = _description.draw(field, _focus == Focus::Description);

    _tableArea = {kTableRow, 0, std::max(0, rows - kTableRow - kRowsBelow), columns};
    _table.draw(screen, _tableArea, _focus == Focus::Table);
    title.part(0, columns - kInset).putRight(_table.position(), {.dim = true});

    const Line buttons(screen, rows - 3, 0, columns);
    _saveArea = {rows - 3, kInset, 1, 0};
    drawButton(buttons, _saveArea, "[ Save ]", Focus::Save);
    _cancelArea = {rows - 3, _saveArea.column + _saveArea.columns + 2, 1, 0};
    drawButton(buttons, _cancelArea, "[ Cancel ]", Focus::Cancel);
    Line(screen, rows - 1, 0, columns).put(kInset, "Tab next  Enter choose  Esc cancel", {.dim = true});

    switch (_focus) {
    case Focus::Description:
        screen.placeCursor(kFieldRow, kInset + cursor, true);
        break;
    case Focus::Table:
        screen.placeCursor(_table.chosenLine(), 0, false);
        break;
    case Focus::Save:
        screen.placeCursor(_saveArea.row, _saveArea.column, false);
        break;
    case Focus::Cancel:
        screen.placeCursor(_cancelArea.row, _cancelArea.column, false);
        break;
    }
}

void TerminalSaveInterface::drawButton(const Line& line, Area& place, std::string_view text, Focus focus) const
{
    place.columns = columns(text);
    line.put(place.column, text,
             {.bold = focus == Focus::Save,
              .reverse = _focus == focus,
              .colour = focus == Focus::Save ? Colour::Accent : Colour::Plain});
}

void TerminalSaveInterface::handle(const Input& input)
{
    switch (input.key) {
    case Key::Escape:
        _owner.cancelPressed();
        return;
    case Key::Tab:
        focus(static_cast<Focus>((static_cast<int>(_focus) + 1) % 4));
        return;
    case Key::BackTab:
        focus(static_cast<Focus>((static_cast<int>(_focus) + 3) % 4));
        return;
    case Key::Press:
        press(input);
        return;
    case Key::Release:
    case Key::WheelUp:
    case Key::WheelDown:
        _table.handle(input);
        return;
    default:
        break;
    }
    switch (_focus) {
    case Focus::Description:
        handleDescription(input);
        break;
    case Focus::Table:
        handleTable(input);
        break;
    case Focus::Save:
    case Focus::Cancel:
        handleButton(input);
        break;
    }
}

void TerminalSaveInterface::handleDescription(const Input& input)
{
    if (input.key == Key::Enter)
        _owner.textFieldShouldReturn();
    else if (input.key == Key::Down)
        focus(_table.rows() > 0 ? Focus::Table : Focus::Save);
    else
        _description.handle(input);
}

void TerminalSaveInterface::handleTable(const Input& input)
{
    if (input.key == Key::Up && _table.chosen() == 0)
        focus(Focus::Description);
    else if (input.key == Key::Down && _table.chosen() + 1 >= _table.rows())
        focus(Focus::Save);
    else if (input.is(L'j') || input.is(L'k'))
        handleTable({input.is(L'j') ? Key::Down : Key::Up});
    else
        _table.handle(input);
}

void TerminalSaveInterface::handleButton(const Input& input)
{
    if (input.key == Key::Enter || input.is(L' '))
        _focus == Focus::Save ? _owner.savePressed() : _owner.cancelPressed();
    else if (input.key == Key::Left || input.is(L'h'))
        focus(Focus::Save);
    else if (input.key == Key::Right || input.is(L'l'))
        focus(Focus::Cancel);
    else if (input.key == Key::Up || input.is(L'k'))
        focus(_table.rows() > 0 ? Focus::Table : Focus::Description);
}

void TerminalSaveInterface::press(const Input& input)
{
    const auto onto = [&](const Area& area) { return area.holds(input.row, input.column); };
    if (onto(_descriptionArea)) {
        focus(Focus::Description);
        return;
    }
    _owner.backgroundTouched();
    if (onto(_saveArea)) {
        _owner.savePressed();
    } else if (onto(_cancelArea)) {
        _owner.cancelPressed();
    } else if (onto(_tableArea)) {
        focus(Focus::Table);
        _table.handle(input);
    }
}

} // namespace kestrum::terminal
