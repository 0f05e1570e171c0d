#include "frontends/terminal/Navigation.h"

#include "frontends/terminal/Box.h"

#include <algorithm>
#include <array>
#include <utility>

namespace kestrum::terminal {

namespace {

struct HelpLine {
    std::string_view keys, what;
};

constexpr std::array kHelpOfPanes = {
    HelpLine{"Up Down  k j", "choose a row"},
    HelpLine{"Home End  g G", "first row, last row"},
    HelpLine{"PgUp PgDn", "a screen up, down"},
    HelpLine{"Right Enter l", "open the row"},
    HelpLine{"Left Esc h", "back"},
    HelpLine{"< >", "scroll a row sideways"},
    HelpLine{"/  n", "jump to a name, next"},
    HelpLine{"Space", "freeze, live again"},
    HelpLine{", .", "a refresh back, on"},
    HelpLine{"s", "save, where offered"},
    HelpLine{std::string_view(&kKeepKey, 1), "keep 15 minutes"},
    HelpLine{"q", "quit"},
};
constexpr std::array kHelpOfSheets = {
    HelpLine{"Tab r", "table: sort, reverse"},
    HelpLine{"Left Right", "plot: move the cursor"},
    HelpLine{"Tab 1 2 3", "plot: choose the time"},
    HelpLine{"Ctrl-L", "redraw"},
    HelpLine{"mouse", "click, wheel"},
};
constexpr int kHelpKeys = 14; // columns

std::vector<HelpLine> helpLines()
{
    std::vector<HelpLine> lines(kHelpOfPanes.begin(), kHelpOfPanes.end());
    for (const auto& each : kSheetCommands)
        lines.push_back({{&each.key, 1}, each.name});
    lines.insert(lines.end(), kHelpOfSheets.begin(), kHelpOfSheets.end());
    return lines;
}

} // namespace

void TerminalTableScreen::setToolbarItems(std::vector<ToolbarItem> items, bool)
{
    _items = std::move(items);
    _repaint.repaintLater();
}

void TerminalTableScreen::setHint(std::string_view text)
{
    if (text == _hint)
        return;
    _hint = text;
    _repaint.repaintLater();
}

bool TerminalTableScreen::isSpinning() const
{
    return std::ranges::any_of(_items, [](const ToolbarItem& each) {
        const auto* indicator = std::get_if<ActivityIndicatorItem>(&each);
        return indicator && indicator->running;
    });
}

std::string TerminalTableScreen::status() const
{
    for (const auto& each : _items)
        if (const auto* label = std::get_if<LabelItem>(&each))
            return label->text;
    return {};
}

const SaveItem* TerminalTableScreen::saveItem() const
{
    for (const auto& each : _items)
        if (const auto* save = std::get_if<SaveItem>(&each))
            return save;
    return nullptr;
}

void TerminalNavigationView::show(TableScreen& pane, std::vector<std::string> titles, Transition, bool)
{
    // All panes come from the same toolkit, so the cast is safe. A terminal shows no transitions.
    _pane = static_cast<TerminalTableScreen*>(&pane);
    _jump.reset();
    setTitles(std::move(titles));
}

void TerminalNavigationView::setTitles(std::vector<std::string> titles)
{
    _titles.clear();
    for (const auto& title : titles)
        _titles.push_back(beginning(title));
    _repaint.repaintLater();
}

void TerminalNavigationView::setToolbarHidden(bool hidden)
{
    _toolbarHidden = hidden;
    _repaint.repaintLater();
}

void TerminalNavigationView::setNotice(std::string_view text)
{
    _notice = text;
    _repaint.repaintLater();
}

void TerminalNavigationView::setFrozen(std::optional<FrozenMoment> moment)
{
    // The panes' status says which moment it is.
    _frozen = std::move(moment);
    _repaint.repaintLater();
}

void TerminalNavigationView::present(SaveInterface& screen, bool)
{
    _save = static_cast<TerminalSaveInterface*>(&screen);
    _jump.reset();
    _help.reset();
    _repaint.repaintLater();
}

void TerminalNavigationView::dismiss(bool)
{
    _save = nullptr;
    _repaint.repaintLater();
}

std::unique_ptr<Sheet> TerminalNavigationView::openSheet(SheetOwner& owner)
{
    _jump.reset();
    return std::make_unique<TerminalSheet>(owner, _repaint, _sheet, std::exchange(_asked, L'\0'));
}

void TerminalNavigationView::draw(Screen& screen, std::string_view spinner, bool inBackground)
{
    screen.clear();
    screen.setDimmed(inBackground || _help);
    if (_save) {
        _save->draw(screen);
        return;
    }
    if (_sheet) {
        _sheet->draw(screen);
        if (_help) {
            screen.setDimmed(inBackground);
            drawHelp(screen);
        }
        return;
    }
    const int rows = screen.rows(), columns = std::min(screen.columns(), kColumn);
    _bottom = rows - 1;
    int cursorRow = _bottom, cursorColumn = 0;
    const auto notice = wrapped(_notice, columns - 2 * kInset);
    const int lines = std::clamp(static_cast<int>(notice.size()), 0, std::max(0, rows - 2));
    for (int each = 0; each < lines; ++each)
        Line(screen, _bottom - lines + each, 0, columns)
            .put(kInset, notice[static_cast<std::size_t>(each)], {.colour = Colour::Accent});
    if (_pane) {
        const Area area{1, 0, std::max(0, rows - 2 - lines), columns};
        _pane->table().draw(screen, area, true);
        if (_pane->table().rows() == 0)
            drawHint(screen, area);
        cursorRow = _pane->table().chosenLine();
    }
    drawTitle({screen, 0, 0, columns});
    const Line bottom(screen, _bottom, 0, columns);
    if (_jump) {
        const int end = bottom.put(kInset, std::string("/").append(_jump->name.text()), {.bold = true});
        if (!_jump->found)
            bottom.put(end + kGap, "no such row", {.colour = Colour::Danger});
        cursorRow = _bottom;
        cursorColumn = kInset + 1 + terminal::columns(_jump->name.beforeCursor());
    } else if (!_toolbarHidden) {
        drawToolbar(bottom, spinner);
    }
    if (_help) {
        screen.setDimmed(inBackground);
        drawHelp(screen);
    }
    screen.placeCursor(cursorRow, cursorColumn, _jump.has_value());
}

void TerminalNavigationView::drawHint(Screen& screen, Area area) const
{
    int row = area.row + 1;
    for (const auto& each : wrapped(_pane->hint(), area.columns - 2 * kInset))
        if (row < area.row + area.rows)
            Line(screen, row++, 0, area.columns).put(kInset, each, {.dim = true});
}

void TerminalNavigationView::drawTitle(const Line& line) const
{
    const std::string position = _pane ? _pane->table().position() : std::string();
    const int width = line.width() - 2 * kInset - (position.empty() ? 0 : columns(position) + kGap);
    std::string path;
    for (const auto& title : _titles)
        path += (path.empty() ? "" : " › ") + title;
    line.put(kInset, cutInTheMiddle(path, width), {.bold = true});
    line.part(0, line.width() - kInset).putRight(position, {.dim = true});
}

void TerminalNavigationView::drawToolbar(const Line& line, std::string_view spinner)
{
    if (!_pane)
        return;
    // The most important hints come first. Hints without room beside the status are omitted, from the end.
    _hints.clear();
    if (_pane->saveItem())
        _hints.push_back({L's', "s save"});
    if (_frozen) {
        _hints.push_back({L' ', "Space live"});
        if (_frozen->hasEarlier)
            _hints.push_back({L',', ", back"});
        if (_frozen->hasLater)
            _hints.push_back({L'.', ". on"});
    }
    auto sheets = static_cast<std::ptrdiff_t>(_hints.size());
    _hints.push_back({L'?', "? help"});
    _hints.push_back({L'q', "q quit"});
    const int spinning = _pane->isSpinning() ? columns(spinner) + 1 : 0;
    int room = line.width() - 2 * kInset - spinning - columns(_pane->status());
    // The sheets are named where there is room for all hints: the help has them too.
    for (const auto& each : kSheetCommands) {
        const Hint hint{static_cast<wchar_t>(each.key), std::string(1, each.key) + ' ' + std::string(each.brief)};
        int wanted = columns(hint.text) + kGap;
        for (const auto& other : _hints)
            wanted += columns(other.text) + kGap;
        if (wanted <= room && _delegate.offers(each.kind, rowFor(each)))
            _hints.insert(_hints.begin() + sheets++, hint);
    }
    std::size_t kept = 0;
    for (; kept < _hints.size() && columns(_hints[kept].text) + kGap <= room; ++kept)
        room -= columns(_hints[kept].text) + kGap;
    // Save and the way back to live are always shown; the status is shortened for them.
    const auto always = static_cast<std::size_t>(_pane->saveItem() != nullptr) + (_frozen ? 1U : 0U);
    kept = std::max(kept, always);
    _hints.resize(kept);

    int right = line.width() - kInset;
    for (auto each = _hints.rbegin(); each != _hints.rend(); ++each) {
        right -= columns(each->text);
        each->column = right;
        const bool action = each->key == L's' || each->key == L' ';
        line.put(right, each->text, {.dim = !action, .colour = action ? Colour::Accent : Colour::Plain});
        right -= kGap;
    }
    if (spinning)
        line.put(kInset, spinner, {.colour = Colour::Accent});
    line.put(kInset + spinning, cutAtTheEnd(_pane->status(), right - kInset - spinning));
}

void TerminalNavigationView::drawHelp(Screen& screen)
{
    const auto lines = helpLines();
    int widest = 0;
    for (const auto& each : lines)
        widest = std::max(widest, kHelpKeys + columns(each.what));
    const auto count = static_cast<int>(lines.size());
    const int side = screen.columns() >= kColumn ? 2 : 1; // columns of lines
    const Area inside = drawBox(screen, (count + side - 1) / side, side * widest + (side - 1) * kGap);
    // Lines without room come with the next key.
    int room = side * inside.rows;
    const bool isCut = count - *_help > room && inside.rows > 2;
    room -= isCut ? side : 0;
    _nextHelp = isCut ? *_help + room : 0;
    const int rows = inside.rows - (isCut ? 1 : 0);
    for (int i = 0; i < std::min(room, count - *_help); ++i) {
        const Line line =
            Line(screen, inside.row + i % rows, inside.column, inside.columns).part(i / rows * (widest + kGap), widest);
        const auto& [keys, what] = *(lines.begin() + *_help + i);
        line.put(0, keys, {.bold = true});
        line.put(kHelpKeys, what);
    }
    if (isCut)
        Line(screen, inside.row + rows, inside.column, inside.columns)
            .put(0, "any key: more  Esc: close", {.dim = true});
}

void TerminalNavigationView::handle(const Input& input)
{
    _repaint.repaintLater();
    if (_save)
        _save->handle(input);
    else if (_help)
        handleHelp(input);
    else if (_sheet && !input.is(L'?') && !input.is(L'q'))
        _sheet->handle(input);
    else if (_jump)
        handleJump(input);
    else if (_pane)
        handlePane(input);
}

/// Any key or mouse press shows what had no room, and then closes it.
void TerminalNavigationView::handleHelp(const Input& input)
{
    if (input.key == Key::Release || input.key == Key::Other)
        return;
    if (_nextHelp > 0 && input.key != Key::Escape)
        _help = _nextHelp;
    else
        _help.reset();
}

void TerminalNavigationView::handleJump(const Input& input)
{
    auto& table = _pane->table();
    const auto from = table.find(_jump->from).value_or(_jump->from.row);
    switch (input.key) {
    case Key::Enter:
        _lastJump = _jump->name.text();
        _jump.reset();
        return;
    case Key::Escape:
    case Key::Press:
        table.choose(from);
        _jump.reset();
        return;
    case Key::Backspace:
        if (_jump->name.isEmpty()) {
            _jump.reset();
            return;
        }
        break;
    default:
        break;
    }
    if (!_jump->name.handle(input))
        return;
    _jump->found = table.choose(_jump->name.text(), from);
    if (!_jump->found || _jump->name.isEmpty())
        table.choose(from);
}

void TerminalNavigationView::handlePane(const Input& input)
{
    auto& table = _pane->table();
    switch (input.key) {
    case Key::Character:
        handleCommand(input.character);
        return;
    case Key::Left:
    case Key::Escape:
    case Key::Backspace:
        _delegate.backRequested();
        return;
    case Key::Press:
        if (input.row == 0)
            _delegate.backRequested(); // the title line works as the back button
        else if (input.row == _bottom && !_toolbarHidden)
            for (const auto& each : std::vector(_hints)) {
                if (input.column >= each.column && input.column < each.column + columns(each.text))
                    handleCommand(each.key);
            }
        else
            table.handle(input);
        return;
    default:
        table.handle(input);
        return;
    }
}

void TerminalNavigationView::handleCommand(wchar_t key)
{
    auto& table = _pane->table();
    switch (key) {
    case L'j':
        table.handle({Key::Down});
        return;
    case L'k':
        table.handle({Key::Up});
        return;
    case L'l':
        table.handle({Key::Right});
        return;
    case L'h':
        _delegate.backRequested();
        return;
    case L'g':
        table.handle({Key::Home});
        return;
    case L'G':
        table.handle({Key::End});
        return;
    case L'<':
        table.handle({Key::ShiftLeft});
        return;
    case L'>':
        table.handle({Key::ShiftRight});
        return;
    case L'/':
        _jump = Jump{{}, table.placeOf(table.chosen())};
        return;
    case L'n':
        if (!_lastJump.empty())
            table.choose(_lastJump, table.chosen() + 1);
        return;
    case L' ':
        _delegate.lookRequested(Look::Freeze);
        return;
    case L',':
        _delegate.lookRequested(Look::Earlier);
        return;
    case L'.':
        _delegate.lookRequested(Look::Later);
        return;
    case L's':
        // A copy, because the action may replace the toolbar that holds it.
        if (const auto* save = _pane->saveItem()) {
            const auto action = save->action;
            action();
        }
        return;
    case static_cast<wchar_t>(kKeepKey):
        _delegate.keepRequested();
        return;
    case L'?':
        _help = 0;
        return;
    case L'q':
        _quit();
        return;
    default:
        openSheetOf(key);
        return;
    }
}

/// The chosen row, for a sheet of a row.
std::optional<std::size_t> TerminalNavigationView::rowFor(const SheetCommand& command) const
{
    const auto& table = _pane->table();
    return command.isOfRow && table.rows() > 0 ? std::optional(table.chosen()) : std::nullopt;
}

void TerminalNavigationView::openSheetOf(wchar_t key)
{
    const auto command =
        std::ranges::find(kSheetCommands, key, [](const auto& each) { return static_cast<wchar_t>(each.key); });
    if (command == kSheetCommands.end())
        return;
    _asked = key; // for `openSheet`
    _delegate.sheetRequested(command->kind, rowFor(*command));
    _asked = L'\0';
}

} // namespace kestrum::terminal
